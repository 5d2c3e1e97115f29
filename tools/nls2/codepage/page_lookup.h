// What code page numbers and names open, for `codepages` and `locales`.
#pragma once

#include "base/json.h"

#include <cstdint>
#include <string>

namespace nls2::tool {

Answer describePage(int32_t number);

// Describes a code page given by number or name, with a warning if its number and names open
// different tables. Throws Error if ICU has no such page.
Answer lookUpPage(const std::string &asked);

// The numbers that open pages by name, and the Windows names.
Answer allPages();

// All names that open a page, a line each.
Answer allPageNames();

} // namespace nls2::tool
