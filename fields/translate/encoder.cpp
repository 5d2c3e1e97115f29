// Text into bytes of the destination page, as far as there is room, and what went wrong.
#include "translate/encoder.h"

#include "pages/page_traits.h"

#include <algorithm>
#include <cstring>
#include <new>
#include <unicode/utf16.h>
#include <utility>

namespace zelfields {
namespace {

// ICU takes no more at once.
constexpr std::ptrdiff_t unitsAtOnce = 0x3FFFFFFF;
constexpr int64_t bytesAtOnce = 0x7FFFFFFF;

constexpr char shiftIn = 0x0F;

bool stops(UErrorCode error) {
  if (error == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc();
  }
  return U_FAILURE(error) && error != U_BUFFER_OVERFLOW_ERROR;
}

// Units that the converter has read and keeps back: they may begin a sequence with a code of its
// own.
int64_t keptBack(const UConverter *to) {
  UErrorCode error = U_ZERO_ERROR;
  return ucnv_fromUCountPending(to, &error);
}

} // namespace

bool Encoder::add(std::u16string_view text) {
  if (text.empty()) {
    return true;
  }
  if (const char16_t half = std::exchange(half_, u'\0'); half != 0 && !encode({&half, 1})) {
    return false;
  }
  if (losesHalves(ucnv_getType(to_)) && U16_IS_LEAD(text.back())) {
    half_ = text.back();
    text.remove_suffix(1);
  }
  return encode(text);
}

bool Encoder::encode(std::u16string_view text) {
  Progress piece = {text.data(), text.data(), text.data() + text.size()};
  UErrorCode error = U_ZERO_ERROR;
  do {
    error = U_ZERO_ERROR;
    whole_ != nullptr             ? writeWhole(piece, error)
    : room_.size > 0 && allFits() ? write(piece, error)
                                  : count(piece, error);
    if (stops(error)) {
      return noteBad(resolved(piece));
    }
  } while (piece.source != piece.end || error == U_BUFFER_OVERFLOW_ERROR);
  before_ += piece.end - piece.begin;
  return true;
}

void Encoder::write(Progress &piece, UErrorCode &error) {
  char *target = room_.begin;
  ucnv_fromUnicode(to_, &target, target + std::min(room_.size, bytesAtOnce), &piece.source,
                   piece.source + std::min(piece.end - piece.source, unitsAtOnce), nullptr, false,
                   &error);
  const int64_t written = target - room_.begin;
  room_ = {target, room_.size - written};
  size_ += written;
}

void Encoder::makeRoomFor(std::size_t units) {
  const std::size_t most = (units + 10) * static_cast<std::size_t>(ucnv_getMaxCharSize(to_));
  if (whole_ != nullptr && whole_->bytes.size() < most) {
    whole_->bytes.resize(most);
    whole_->offsets.resize(most);
  }
}

void Encoder::writeWhole(Progress &piece, UErrorCode &error) {
  const auto units = std::min(piece.end - piece.source, unitsAtOnce);
  makeRoomFor(static_cast<std::size_t>(units));
  const int64_t start = before_ + (piece.source - piece.begin);
  char *target = whole_->bytes.data();
  ucnv_fromUnicode(to_, &target, target + std::min<std::size_t>(whole_->bytes.size(), INT32_MAX),
                   &piece.source, piece.source + units, whole_->offsets.data(), false, &error);
  const int64_t written = target - whole_->bytes.data();
  const int64_t fitting = allFits() ? std::min(written, room_.size) : 0;
  std::memcpy(room_.begin, whole_->bytes.data(), static_cast<std::size_t>(fitting));
  room_ = {room_.begin + fitting, room_.size - fitting};
  if (fitting < written && allFits()) {
    unfit_ = start + std::max(whole_->offsets[static_cast<std::size_t>(fitting)], 0);
  }
  size_ += written;
}

// The room is full. The first byte that comes now shows the first character that does not fit: one
// that is dropped takes no room.
void Encoder::count(Progress &piece, UErrorCode &error) {
  char bytes[256];
  int32_t offsets[256] = {-1}; // some converters set none
  char *target = bytes;
  const int64_t start = before_ + (piece.source - piece.begin);
  const int64_t before = resolved(piece);
  ucnv_fromUnicode(to_, &target, bytes + sizeof bytes, &piece.source,
                   piece.source + std::min(piece.end - piece.source, unitsAtOnce), offsets, false,
                   &error);
  size_ += target - bytes;
  if (target == bytes || !allFits()) {
    return;
  }
  if (offsets[0] >= 0) {
    unfit_ = start + offsets[0];
    return;
  }
  // The rest of a character that had some room.
  int64_t last = before - before_;
  if (last > 0) {
    U16_BACK_1(piece.begin, 0, last);
  }
  unfit_ = before_ + last;
}

// Units before the first that is not encoded yet.
int64_t Encoder::resolved(const Progress &piece) const {
  return before_ + (piece.source - piece.begin) - keptBack(to_);
}

bool Encoder::noteBad(int64_t after) {
  UChar units[8];
  int8_t count = std::size(units);
  UErrorCode error = U_ZERO_ERROR;
  ucnv_getInvalidUChars(to_, units, &count, &error);
  bad_ = std::max<int64_t>(after - count, 0);
  return false;
}

bool Encoder::isSettled() const { return half_ == 0 && keptBack(to_) == 0; }

bool Encoder::finish() {
  if (before_ == 0 && half_ == 0) {
    return true;
  }
  char bytes[64];
  char *target = bytes;
  const char16_t *source = &half_;
  const int half = half_ != 0 ? 1 : 0;
  const int64_t kept = keptBack(to_) + half;
  before_ += half;
  UErrorCode error = U_ZERO_ERROR;
  ucnv_fromUnicode(to_, &target, bytes + sizeof bytes, &source, source + half, nullptr, true,
                   &error);
  if (stops(error)) {
    return noteBad(before_ - keptBack(to_));
  }
  const int64_t last = target - bytes;
  size_ += last;
  if (last <= room_.size && allFits()) {
    std::memcpy(room_.begin, bytes, static_cast<std::size_t>(last));
    room_ = {room_.begin + last, room_.size - last};
  } else if (last > 0 && allFits()) {
    const bool onlyShift = last - 1 <= room_.size && bytes[last - 1] == shiftIn;
    unfit_ = onlyShift ? before_ : before_ - kept;
  }
  return true;
}

} // namespace zelfields
