// The pages that ICU has, and which of their names are near to one that it lacks.
#include "guard.h"
#include "pages/page.h"

#include <algorithm>
#include <string>
#include <string_view>
#include <vector>

namespace zelfields {
namespace {

constexpr std::size_t longestName = 60; // of ICU's
constexpr std::size_t mostNames = 3;

// A name without what ICU does not compare.
std::string bareName(std::string_view name) {
  std::string bare;
  for (const char letter : name) {
    if (letter != '-' && letter != '_' && letter != ' ') {
      bare += letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter | 0x20) : letter;
    }
  }
  return bare;
}

// Letters to insert, drop, change, or swap with the next.
std::size_t letterDistance(std::string_view a, std::string_view b) {
  std::size_t table[longestName + 1][longestName + 1];
  for (std::size_t i = 0; i <= a.size(); ++i) {
    for (std::size_t j = 0; j <= b.size(); ++j) {
      std::size_t &cell = table[i][j] = i + j;
      if (i > 0 && j > 0) {
        const std::size_t change = a[i - 1] == b[j - 1] ? 0 : 1;
        cell = std::min({table[i - 1][j] + 1, table[i][j - 1] + 1, table[i - 1][j - 1] + change});
      }
      if (i > 1 && j > 1 && a[i - 1] == b[j - 2] && a[i - 2] == b[j - 1]) {
        cell = std::min(cell, table[i - 2][j - 2] + 1);
      }
    }
  }
  return table[a.size()][b.size()];
}

struct NearName {
  std::size_t distance;
  const char *name;
};

// All names of a page, its own first.
template <class Use>
void forEachName(const char *page, Use use) {
  UErrorCode error = U_ZERO_ERROR;
  const uint16_t count = ucnv_countAliases(page, &error);
  for (uint16_t i = 0; i < count && U_SUCCESS(error); ++i) {
    if (const char *alias = ucnv_getAlias(page, i, &error)) {
      use(alias);
    }
  }
}

// Names that differ from `unknown` in few letters, one a page, the most similar first.
std::vector<NearName> nearNames(std::string_view unknown) {
  std::vector<NearName> found;
  const std::string asked = bareName(unknown);
  if (asked.size() > longestName) {
    return found;
  }
  const std::size_t few = 1 + asked.size() / 4;
  for (int32_t i = 0, pages = ucnv_countAvailable(); i < pages; ++i) {
    NearName best = {few + 1, nullptr};
    forEachName(ucnv_getAvailableName(i), [&](const char *name) {
      const std::string bare = bareName(name);
      const std::size_t distance =
          bare.size() <= longestName ? letterDistance(asked, bare) : few + 1;
      if (distance < best.distance && 2 * distance < std::max(asked.size(), bare.size())) {
        best = {distance, name};
      }
    });
    const bool isKnown = std::ranges::any_of(found, [&](const NearName &other) {
      return best.name != nullptr && std::string_view(other.name) == best.name;
    });
    if (best.name != nullptr && !isKnown) {
      found.push_back(best);
    }
  }
  std::stable_sort(found.begin(), found.end(), [](const NearName &one, const NearName &two) {
    return one.distance < two.distance;
  });
  found.resize(std::min(found.size(), mostNames));
  return found;
}

} // namespace
} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_NearPageNames(const char *name, char *names, int64_t room) {
  if (name == nullptr || names == nullptr || room < 1) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  names[0] = '\0';
  return guarded([&] {
    std::string text;
    for (const NearName &near : nearNames(name)) {
      const std::string more = (text.empty() ? "" : ", ") + std::string(near.name);
      if (text.size() + more.size() < static_cast<uint64_t>(room)) {
        text += more;
      }
    }
    names[text.copy(names, text.size())] = '\0';
    return 0;
  });
}

int32_t NLS2F_PageCount(int64_t *count) {
  if (count == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  *count = ucnv_countAvailable();
  return 0;
}

int32_t NLS2F_PageAt(int64_t index, const char **name) {
  if (name == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  const bool inList = index >= 0 && index < ucnv_countAvailable();
  *name = inList ? ucnv_getAvailableName(static_cast<int32_t>(index)) : nullptr;
  return *name != nullptr ? 0 : NLS2_ERR_INVALID_PARAMETER;
}
