// Names near to one that is unknown.

#include "near_names.h"

#include <algorithm>
#include <numeric>
#include <string_view>
#include <utility>

namespace nls2::tool {

namespace {

char lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

// Letters to insert, drop, change, or swap with the next: the rows of the usual table.
std::size_t distance(std::string_view a, std::string_view b) {
  std::vector<std::size_t> before;
  std::vector<std::size_t> last;
  std::vector<std::size_t> row(b.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t{0});
  for (std::size_t i = 1; i <= a.size(); ++i) {
    before = std::exchange(last, row);
    row[0] = i;
    for (std::size_t j = 1; j <= b.size(); ++j) {
      const std::size_t change = lower(a[i - 1]) == lower(b[j - 1]) ? 0 : 1;
      row[j] = std::min({last[j] + 1, row[j - 1] + 1, last[j - 1] + change});
      if (i > 1 && j > 1 && lower(a[i - 1]) == lower(b[j - 2]) &&
          lower(a[i - 2]) == lower(b[j - 1])) {
        row[j] = std::min(row[j], before[j - 2] + 1);
      }
    }
  }
  return row[b.size()];
}

} // namespace

std::vector<std::string> nearNames(const std::string &unknown,
                                   const std::vector<std::string> &known, std::size_t most) {
  const std::size_t limit = 1 + unknown.size() / 4;
  std::vector<std::pair<std::size_t, std::string>> near;
  for (const std::string &name : known) {
    const std::size_t letters = distance(unknown, name);
    if (letters <= limit && letters < name.size()) {
      near.emplace_back(letters, name);
    }
  }
  std::stable_sort(near.begin(), near.end(),
                   [](const auto &a, const auto &b) { return a.first < b.first; });
  std::vector<std::string> names;
  for (const auto &[letters, name] : near) {
    if (letters == near.front().first && names.size() < most &&
        std::find(names.begin(), names.end(), name) == names.end()) {
      names.push_back(name);
    }
  }
  return names;
}

std::string didYouMean(const std::vector<std::string> &names) {
  std::string text;
  for (std::size_t i = 0; i < names.size(); ++i) {
    text += i == 0 ? " (did you mean " : i + 1 == names.size() ? " or " : ", ";
    text += names[i];
  }
  return text.empty() ? text : text + "?)";
}

} // namespace nls2::tool
