// What code page numbers and names open, for `codepages` and `locales`.
#pragma once

#include "base/json.h"

#include <cstdint>
#include <string>

namespace nls2::tool {

Answer describePage(int32_t number);

// Describes a code page given by number or name, with a warning if its number and names open
// different tables. Throws Error if neither the library nor ICU knows it.
Answer lookUpPage(const std::string &asked);

// The library's tables: the listed numbers and the Windows names.
Answer allPages();

} // namespace nls2::tool
