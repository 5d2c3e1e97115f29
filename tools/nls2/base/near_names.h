// Suggestions for a name that is unknown.
#pragma once

#include <algorithm>
#include <string>
#include <string_view>
#include <vector>

namespace nls2::tool {

inline char lowerCase(char letter) {
  return static_cast<char>(letter + (letter >= 'A' && letter <= 'Z' ? 'a' - 'A' : 0));
}

// How many letters must be inserted, dropped, changed or swapped with the next. Ignores case.
inline std::size_t letterDistance(std::string_view a, std::string_view b) {
  const auto alike = [](char x, char y) { return lowerCase(x) == lowerCase(y); };
  std::vector table(a.size() + 1, std::vector<std::size_t>(b.size() + 1));
  for (std::size_t i = 0; i <= a.size(); ++i) {
    for (std::size_t j = 0; j <= b.size(); ++j) {
      std::size_t &cell = table[i][j] = i + j;
      if (i > 0 && j > 0) {
        const std::size_t change = alike(a[i - 1], b[j - 1]) ? 0 : 1;
        cell = std::min({table[i - 1][j] + 1, table[i][j - 1] + 1, table[i - 1][j - 1] + change});
      }
      if (i > 1 && j > 1 && alike(a[i - 1], b[j - 2]) && alike(a[i - 2], b[j - 1])) {
        cell = std::min(cell, table[i - 2][j - 2] + 1);
      }
    }
  }
  return table[a.size()][b.size()];
}

// Up to three of the known names: the nearest, if they differ in few letters.
inline std::vector<std::string> nearNames(const std::string &unknown,
                                          const std::vector<std::string> &known) {
  std::size_t nearest = 1 + unknown.size() / 4;
  std::vector<std::string> names;
  for (const std::string &name : known) {
    const std::size_t letters = letterDistance(unknown, name);
    if (letters > nearest || 2 * letters >= std::max(unknown.size(), name.size()) ||
        std::ranges::find(names, name) != names.end()) {
      continue;
    }
    if (letters < nearest) {
      names.clear();
      nearest = letters;
    }
    if (names.size() < 3) {
      names.push_back(name);
    }
  }
  return names;
}

// " (did you mean a, b or c?)" for the end of a message; empty if there are no names.
inline std::string didYouMean(const std::vector<std::string> &names) {
  std::string text;
  for (std::size_t i = 0; i < names.size(); ++i) {
    text += i == 0 ? " (did you mean " : i + 1 == names.size() ? " or " : ", ";
    text += names[i];
  }
  return text.empty() ? text : text + "?)";
}

} // namespace nls2::tool
