// A text translated piece by piece.
#include "translate/chunks.h"

#include "guard.h"
#include "pages/page.h"
#include "pages/page_traits.h"
#include "translate/translator.h"

#include <algorithm>
#include <new>

namespace zelfields {
namespace {

constexpr std::size_t largestWindow = 1 << 16;
constexpr std::size_t lookaround = 64; // bytes in which a character begins and ends

icu::LocalUConverterPointer copyOf(const UConverter *converter) {
  UErrorCode error = U_ZERO_ERROR;
  icu::LocalUConverterPointer copy = cloneOf(converter, error);
  if (U_FAILURE(error)) {
    throw std::bad_alloc();
  }
  return copy;
}

} // namespace

Chunks::Chunks(Path &path)
    : path_(path), stops_(path.policy().onBad == NLS2F_STOP),
      holds_(looksAhead(ucnv_getType(path.to()))), decoder_(path.from(), {}) {}

void Chunks::begin() {
  encoder_.emplace(path_.begin(), Room{nullptr, 0});
  decoder_ = Decoder(path_.from(), {});
  count_ = 0;
  written_.clear();
  problem_.reset();
  isEnded_ = false;
  position_ = 0;
  window_.clear();
  if (stops_) {
    moveWindow();
  }
}

bool Chunks::translate(std::string_view piece, bool last, Room room, int64_t &read, Done &done,
                       NLS2F_Problem &problem) {
  piece_ = piece;
  from_ = 0;
  if (!encoder_) {
    begin();
  }
  decoder_ = Decoder(path_.from(), piece);
  const int64_t replaced = path_.replaced().total();
  deliver(room, done);
  while (written_.empty() && !problem_ && !isEnded_ && (last || !decoder_.isDone())) {
    step(last);
    deliver(room, done);
  }
  read = problem_ ? std::clamp<int64_t>(problem_->offset - position_, 0, decoder_.read())
                  : decoder_.read();
  if (stops_ && !problem_) {
    window_.append(piece.substr(from_, static_cast<std::size_t>(read) - from_));
  }
  position_ += read;
  done.replaced = path_.replaced().total() - replaced;
  if (!written_.empty()) {
    fail(problem, NLS2F_NO_ROOM);
    problem.offset = position_;
    return false;
  }
  if (problem_) {
    problem_->size = problem.size;
    problem = *problem_;
    abandon();
    return false;
  }
  if (isEnded_) {
    abandon();
  }
  return true;
}

// Decodes units, and encodes them once there are enough.
void Chunks::step(bool last) {
  count_ += decoder_.decode({units_.data() + count_, units_.size() - count_}, last);
  const bool ends = decoder_.isDone() && (last || decoder_.hasStopped());
  if (!ends && holds_ && count_ < units_.size()) {
    return;
  }
  const bool encodes = encode();
  if (!encodes || ends) {
    finish(encodes);
  } else if (stops_) {
    moveWindow();
  }
}

bool Chunks::encode() {
  const int64_t before = encoder_->size();
  written_.resize((count_ + 10) * static_cast<std::size_t>(ucnv_getMaxCharSize(path_.to())));
  encoder_->into({written_.data(), std::ssize(written_)});
  const bool encodes = encoder_->add({units_.data(), count_});
  written_.resize(static_cast<std::size_t>(encoder_->size() - before));
  count_ = 0;
  return encodes;
}

// Closes the text: at its end, or before bytes or a character that stop it.
void Chunks::finish(bool encodes) {
  std::array<char, 64> end;
  const int64_t before = encoder_->size();
  if (encodes || encoder_->isSettled()) {
    encoder_->into({end.data(), std::ssize(end)});
    encodes = encoder_->finish() && encodes;
    written_.append(end.data(), static_cast<std::size_t>(encoder_->size() - before));
  }
  isEnded_ = true;
  if (encodes && !decoder_.hasStopped()) {
    return;
  }
  const std::string text = window();
  const int64_t begin = position_ + static_cast<int64_t>(from_ - window_.size());
  problem_.emplace();
  if (!encodes) {
    fail(*problem_, NLS2F_NOT_IN_PAGE);
    icu::LocalUConverterPointer again;
    setPlaceOfUnit(*problem_, text, before_, encoder_->bad() - windowUnits_, [&] {
      again = copyOf(snapshot_.getAlias());
      return again.getAlias();
    });
  } else {
    // ICU delimits the bytes as in the whole text if they come in one piece.
    const icu::LocalUConverterPointer again = copyOf(snapshot_.getAlias());
    Decoder decoder(again.getAlias(), std::string_view(text).substr(before_));
    while (!decoder.isDone()) {
      decoder.decode(units_, true);
    }
    fail(*problem_, NLS2F_INVALID_BYTES);
    setPlace(*problem_, text, static_cast<int64_t>(before_) + decoder.valid(), decoder.invalid());
  }
  problem_->offset += begin;
}

void Chunks::deliver(Room &room, Done &done) {
  const std::size_t size = written_.copy(room.begin, static_cast<std::size_t>(room.size));
  written_.erase(0, size);
  room = {room.begin + size, room.size - static_cast<int64_t>(size)};
  done.written += static_cast<int64_t>(size);
}

// Problems can be only in what comes now, unless the cut is within a character.
void Chunks::moveWindow() {
  const auto read = static_cast<std::size_t>(decoder_.read());
  window_.append(piece_.substr(from_, read - from_));
  from_ = read;
  UErrorCode error = U_ZERO_ERROR;
  const bool isCut = keepsBack(ucnv_getType(path_.from())) || !encoder_->isSettled() ||
                     ucnv_toUCountPending(path_.from(), &error) != 0;
  if (!isCut || window_.empty() || window_.size() > largestWindow) {
    window_.erase(0, window_.size() - std::min(lookaround, window_.size()));
    before_ = window_.size();
    windowUnits_ = encoder_->units();
    snapshot_ = copyOf(path_.from());
  }
}

std::string Chunks::window() const {
  const std::size_t read = static_cast<std::size_t>(decoder_.read()) - from_;
  return window_ + std::string(piece_.substr(from_, read + lookaround));
}

} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_TranslateChunk(NLS2F_Translator *translator, const void *piece, int64_t length,
                             int32_t last, void *out, int64_t room, int64_t *read, int64_t *written,
                             int64_t *replaced, NLS2F_Problem *problem) {
  for (int64_t *count : {read, written, replaced}) {
    if (count != nullptr) {
      *count = 0;
    }
  }
  if (translator == nullptr || !isRange(piece, length) || !isRange(out, room) || read == nullptr ||
      written == nullptr || (problem != nullptr && !isWhole(problem))) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  const NLS2F_Policy &policy = translator->path.policy();
  if (policy.padding != NLS2F_AS_IS || policy.width != 0) {
    return NLS2_ERR_INVALID_OPTION;
  }
  Done done;
  NLS2F_Problem unseen;
  const int32_t status = guarded([&] {
    const bool good =
        translator->chunks().translate(textOf(piece, length), last != 0, Room::of(out, room), *read,
                                       done, problem != nullptr ? *problem : unseen);
    return good ? 0 : NLS2F_ERR_FIELD;
  });
  if (status == NLS2_ERR_NO_MEMORY) {
    translator->abandonPieces();
    *read = 0;
    return status;
  }
  *written = done.written;
  if (replaced != nullptr) {
    *replaced = done.replaced;
  }
  return status;
}
