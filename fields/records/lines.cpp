// Where lines end.
#include "records/reader.h"

namespace zelfields {
namespace {

constexpr std::size_t npos = std::string_view::npos;

// The first place of a line's end from `from` on, a whole number of units from the line's
// beginning.
std::size_t findEnd(std::string_view text, const std::string &end, std::size_t line,
                    std::size_t from, std::size_t unit) {
  std::size_t found = text.find(end, from);
  while (found != npos && (found - line) % unit != 0) {
    found = text.find(end, found + 1);
  }
  return found;
}

} // namespace

Found nextLine(const LineEnds &ends, Piece &piece, ReaderState &state) {
  const std::string_view text = piece.text;
  const std::size_t line = piece.at;
  // What may begin an end must be seen again with what follows it.
  const std::size_t again = std::max(ends.main.size(), ends.other.size()) - 1;
  const int64_t seen =
      state.total + static_cast<int64_t>(text.size() - std::min(again, text.size()));
  const auto placeOf = [&](int64_t place) {
    return std::max(line, static_cast<std::size_t>(std::max<int64_t>(place - state.total, 0)));
  };
  if (state.mainAt < state.total + static_cast<int64_t>(line)) {
    const std::size_t found =
        findEnd(text, ends.main, line, placeOf(state.mainSearched), ends.unit);
    state.mainAt = found == npos ? -1 : state.total + static_cast<int64_t>(found);
    state.mainSearched = found == npos ? seen : state.mainSearched;
  }
  const std::size_t main = state.mainAt < 0 ? npos : placeOf(state.mainAt);
  const std::size_t other = ends.other.empty() ? npos
                                               : findEnd(text.substr(0, main), ends.other, line,
                                                         placeOf(state.searched), ends.unit);
  if (other != npos) {
    return piece.found(line, other - line, other + ends.other.size());
  }
  if (main != npos) {
    const bool strips = !ends.strip.empty() && text.substr(line, main - line).ends_with(ends.strip);
    return piece.found(line, main - line - (strips ? ends.strip.size() : 0),
                       main + ends.main.size());
  }
  if (piece.isLast && line < text.size()) {
    return piece.found(line, text.size() - line, text.size());
  }
  state.searched = seen;
  return Found::more;
}

} // namespace zelfields
