// A field through ICU: the path that is right for every pair of pages.
#include "translate/path.h"

#include "pages/page.h"
#include "pages/page_traits.h"

#include <algorithm>
#include <cstring>
#include <unicode/uchar.h>
#include <unicode/utf16.h>

namespace zelfields {
namespace {

constexpr int64_t mostTogether = 3; // blanks that the buffer has room for after its text

// Cuts the blanks and nulls off the end of a text. The result is the number of blanks.
int64_t trim(std::u16string_view &text) {
  int64_t blanks = 0;
  while (!text.empty()) {
    if (text.back() > 0x20 && text.back() < 0x7F) {
      break;
    }
    UChar32 character = 0;
    std::size_t start = text.size();
    U16_PREV(text.data(), 0, start, character);
    const bool isBlank = character == 0x20 || u_isblank(character) != 0;
    if (!isBlank && character != 0) {
      break;
    }
    blanks += isBlank ? 1 : 0;
    text = text.substr(0, start);
  }
  return blanks;
}

} // namespace

Path::Path(UConverter *from, UConverter *to, const NLS2F_Policy &policy, UErrorCode &error)
    : policy_(policy), from_(from), to_(to) {
  if (U_SUCCESS(error)) {
    setCallbacks(from, to, policy.onBad, &replaced_, error);
    blanks_.learn(to_, replaced_);
    reserve(2 * usualField);
    looksAhead_ = looksAhead(ucnv_getType(to));
    encoderInto({nullptr, 0}).makeRoomFor(2 * usualField);
  }
}

int64_t Path::maxSize(int64_t length) const {
  if (policy_.padding == NLS2F_FILL) {
    return policy_.width;
  }
  const int64_t units = unitsPerByte(ucnv_getType(from())) * std::min(length, longestField);
  const int64_t most = (units + 10) * ucnv_getMaxCharSize(to());
  return policy_.width != 0 ? std::min(most, policy_.width) : most;
}

bool Path::translate(std::string_view field, Room room, Done &done, NLS2F_Problem &problem) {
  done = {};
  if (field.size() > longestField) {
    return fail(problem, NLS2F_TOO_LONG);
  }
  replaced_ = {};
  return policy_.padding == NLS2F_AS_IS ? asIs(field, room, done, problem)
                                        : padded(field, room, done, problem);
}

bool Path::asIs(std::string_view field, Room room, Done &done, NLS2F_Problem &problem) {
  Decoder decoder(restart(from_), field);
  Encoder encoder = encoderInto(room.first(limit(room)));
  bool encodes = true;
  while (encodes && !decoder.isDone()) {
    const std::size_t units = decoder.decode({units_.get(), pieceUnits}, true);
    encodes = encoder.add({units_.get(), units});
  }
  if (!encodes || !encoder.finish() || decoder.hasStopped()) {
    return badText(field, decoder, encoder, problem);
  }
  if (encoder.size() > limit(room)) {
    return noRoom(field, encoder, encoder.units(), encoder.size(), problem);
  }
  done = {encoder.size(), replaced_.total()};
  return true;
}

bool Path::padded(std::string_view field, Room room, Done &done, NLS2F_Problem &problem) {
  Decoder decoder(restart(from_), field);
  const std::size_t units = decodeAll(decoder, field.size());
  std::u16string_view text(units_.get(), units);
  const int64_t cut = decoder.hasStopped() ? 0 : trim(text);
  const std::size_t null = decoder.hasStopped() ? text.npos : text.find(u'\0');
  if (null != text.npos) {
    return badUnit(NLS2F_EMBEDDED_NULL, field, static_cast<int64_t>(null), problem);
  }
  Encoder encoder = encoderInto(room.first(limit(room)));
  if (!encoder.add(text) || !encoder.finish() || decoder.hasStopped()) {
    return badText(field, decoder, encoder, problem);
  }
  if (policy_.width != 0 && encoder.size() > policy_.width) {
    return noRoom(field, encoder, encoder.units(), encoder.size(), problem);
  }
  done.replaced = replaced_.total();
  const bool wantsBlanks =
      policy_.padding == NLS2F_FILL || (policy_.padding == NLS2F_KEEP_BLANKS && cut > 0);
  return wantsBlanks && blanks_.dependOn(text)
             ? together(field, text.size(), encoder, cut, room, done, problem)
             : apart(field, encoder, cut, room, done, problem);
}

// Blanks after a text that is written.
bool Path::apart(std::string_view field, const Encoder &text, int64_t cut, Room room, Done &done,
                 NLS2F_Problem &problem) {
  const bool isFull = policy_.width != 0 && text.size() == policy_.width;
  if (policy_.padding == NLS2F_KEEP_BLANKS && cut > 0 && !isFull && blanks_.isLacking()) {
    badUnit(NLS2F_NOT_IN_PAGE, field, text.units(), problem);
    problem.codePoint = ' ';
    return false;
  }
  const Sizes sizes = blanks_.after(text.size());
  const int64_t blanks = Blanks::count(policy_, sizes, cut);
  if (blanks == Blanks::cannot) {
    return noExactFill(field, sizes, problem);
  }
  if (sizes.of(blanks) > room.size) {
    return noRoom(field, text, text.units(), sizes.of(blanks), problem);
  }
  blanks_.put(room.begin + text.size(), blanks);
  done.written = sizes.of(blanks);
  done.replaced += blanks_.isReplaced() ? blanks : 0;
  return true;
}

// Text and blanks converted as one, for pages in which a blank's bytes depend on what precedes it.
bool Path::together(std::string_view field, std::size_t units, const Encoder &text, int64_t cut,
                    Room room, Done &done, NLS2F_Problem &problem) {
  std::fill_n(units_.get() + units, mostTogether, u' ');
  const auto encode = [&](int64_t blanks, Room target) {
    static constexpr std::u16string_view more = u"                                ";
    int64_t left = std::min<int64_t>(blanks, mostTogether);
    Encoder encoder = encoderInto(target);
    bool encodes = encoder.add({units_.get(), units + static_cast<std::size_t>(left)});
    for (left = blanks - left; encodes && left > 0; left -= std::ssize(more)) {
      encodes = encoder.add(more.substr(0, static_cast<std::size_t>(left)));
    }
    static_cast<void>(encodes && encoder.finish());
    return encoder;
  };
  Sizes sizes = {{text.size()}};
  for (int64_t blanks = 1; blanks <= mostTogether; ++blanks) {
    sizes.with[static_cast<std::size_t>(blanks)] = encode(blanks, room.first(0)).size();
  }
  const int64_t blanks = Blanks::count(policy_, sizes, cut);
  if (blanks == Blanks::cannot) {
    return noExactFill(field, sizes, problem);
  }
  const Encoder encoded = encode(blanks, room);
  if (sizes.of(blanks) > room.size) {
    return noRoom(field, encoded, static_cast<int64_t>(units), sizes.of(blanks), problem);
  }
  done.written = sizes.of(blanks);
  done.replaced += blanks_.isReplaced() ? blanks : 0;
  return true;
}

Encoder Path::encoderInto(Room room) {
  return {restart(to_), room, looksAhead_ ? &whole_ : nullptr};
}

// Makes room for `units` units and a few blanks; what the buffer held is kept.
void Path::reserve(std::size_t units) {
  if (units > capacity_) {
    std::unique_ptr<char16_t[]> larger(new char16_t[units + mostTogether]);
    std::copy_n(units_.get(), capacity_, larger.get());
    units_ = std::move(larger);
    capacity_ = units;
  }
}

std::size_t Path::decodeAll(Decoder &decoder, std::size_t length) {
  reserve(static_cast<std::size_t>(unitsPerByte(ucnv_getType(from()))) * length);
  std::size_t units = 0;
  for (;;) {
    units += decoder.decode({units_.get() + units, capacity_ - units}, true);
    if (decoder.isDone()) {
      return units;
    }
    reserve(units == capacity_ ? 2 * capacity_ : capacity_);
  }
}

bool Path::badUnit(int32_t kind, std::string_view field, int64_t unit, NLS2F_Problem &problem) {
  fail(problem, kind);
  setPlaceOfUnit(problem, field, 0, unit, [this] { return restart(from_); });
  if (kind == NLS2F_EMBEDDED_NULL) {
    problem.codePoint = 0;
  }
  return false;
}

bool Path::badText(std::string_view field, const Decoder &decoder, const Encoder &encoder,
                   NLS2F_Problem &problem) {
  if (encoder.bad() != Encoder::none) {
    return badUnit(NLS2F_NOT_IN_PAGE, field, encoder.bad(), problem);
  }
  fail(problem, NLS2F_INVALID_BYTES);
  setPlace(problem, field, decoder.valid(), decoder.invalid());
  return false;
}

bool Path::noRoom(std::string_view field, const Encoder &encoder, int64_t units, int64_t needed,
                  NLS2F_Problem &problem) {
  if (encoder.unfit() == Encoder::none || encoder.unfit() >= units) {
    fail(problem, NLS2F_NO_ROOM);
    problem.offset = static_cast<int64_t>(field.size());
  } else {
    badUnit(NLS2F_NO_ROOM, field, encoder.unfit(), problem);
  }
  problem.needed = needed;
  return false;
}

bool Path::noExactFill(std::string_view field, const Sizes &sizes, NLS2F_Problem &problem) const {
  fail(problem, NLS2F_NO_EXACT_FILL, Blanks::nextShorter(policy_, sizes));
  problem.offset = static_cast<int64_t>(field.size());
  return false;
}

} // namespace zelfields
