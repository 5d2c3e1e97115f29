// What bytes mean in a code page, one character at a time.

#include "codepage/page_text.h"

#include <algorithm>

namespace nls2::tool {

bool PageText::decode(std::string_view bytes, std::string &text, NLS2F_Problem &problem) {
  return translateText(translator_.get(), state_ + std::string(bytes), text, problem);
}

// A character is the shortest beginning of the bytes that is valid. In a page without states no
// valid bytes are without text, except for a byte-order mark.
PageText::Piece PageText::next(std::string_view bytes) {
  Piece piece;
  auto problem = sized<NLS2F_Problem>();
  const std::size_t most = std::min(bytes.size(), longest);
  for (piece.length = 1; piece.length <= most; ++piece.length) {
    if (decode(bytes.substr(0, piece.length), piece.text, problem)) {
      piece.meaning = piece.text.empty() ? Meaning::shift : Meaning::character;
      if (piece.meaning == Meaning::shift) {
        const bool replaces = page_.facts().kind == NLS2F_PAGE_MIXED || state_.size() > 64;
        state_ = (replaces ? "" : state_) + std::string(bytes.substr(0, piece.length));
      }
      return piece;
    }
  }
  const auto before = static_cast<int64_t>(state_.size());
  const bool isFirst = problem.kind == NLS2F_INVALID_BYTES && problem.offset == before;
  piece.length = isFirst ? static_cast<std::size_t>(std::clamp<int64_t>(problem.byteCount, 1,
                                                                        static_cast<int64_t>(most)))
                         : 1;
  return piece;
}

// A byte that is invalid alone, but with another one is part of a character, or of an invalid
// sequence of two.
PageText::Piece PageText::meaningOf(char byte) {
  reset();
  Piece piece = next({&byte, 1});
  reset();
  for (int second = 0; second < 256 && piece.meaning == Meaning::none; ++second) {
    const std::string both{byte, static_cast<char>(second)};
    auto problem = sized<NLS2F_Problem>();
    if (decode(both, piece.text, problem) || (problem.offset == 0 && problem.byteCount == 2)) {
      piece.meaning = Meaning::leadByte;
    }
  }
  piece.text = piece.meaning == Meaning::character ? piece.text : "";
  return piece;
}

} // namespace nls2::tool
