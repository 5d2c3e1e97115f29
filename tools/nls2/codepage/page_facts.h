// What the library and ICU make of code pages, as text and as JSON.
#pragma once

#include "json.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace nls2::tool {

struct PageFacts {
  int32_t number = 0;
  int32_t status = 0; // of opening it
  bool hasTwoNulls = false;
  // Nothing without a converter, or where it has none.
  bool opens = false;
  std::optional<std::string> converter;
  std::optional<int32_t> ccsid;
  std::optional<int32_t> maxCharSize;
  std::vector<std::string> windowsNames;
};

struct NameFacts {
  std::string name;
  std::optional<std::string> converter; // nothing where ICU does not know the name
};

struct FoundPages {
  std::vector<PageFacts> numbers; // that the name stands for, or the number given
  std::vector<NameFacts> names;   // the name given, or those that people write for the number
  bool tablesDiffer() const;      // they open different tables of ICU's
};

PageFacts describePage(int32_t number);

// Throws Error where neither the library nor ICU knows what was asked for.
FoundPages lookUpPage(const std::string &asked);

std::string asText(const PageFacts &facts); // lines, each ended by a newline
std::string asText(const FoundPages &found);
Json asJson(const PageFacts &facts);
Json asJson(const FoundPages &found);

// The library's tables: the numbers with names, and the Windows names.
std::string allPagesAsText();
Json allPagesAsJson();

} // namespace nls2::tool
