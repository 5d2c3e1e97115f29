// Facts about code pages as text and as JSON.
#pragma once

#include "codepage/codepage_lookup.h"
#include "json.h"

#include <string>

namespace nls2::tool {

std::string pageAsText(const PageFacts &facts); // lines, each ended by a newline
std::string foundPagesAsText(const FoundPages &found);

Json pageAsJson(const PageFacts &facts);
Json foundPagesAsJson(const FoundPages &found);

// The library's tables: the numbers with names, and the Windows names.
std::string allPagesAsText();
Json allPagesAsJson();

} // namespace nls2::tool
