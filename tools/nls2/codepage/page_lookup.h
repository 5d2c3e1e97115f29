// What the library and ICU make of code pages.
#pragma once

#include "base/json.h"

#include <cstdint>
#include <string>

namespace nls2::tool {

Answer describePage(int32_t number);

// The code page by number or name: what opens it, and whether that opens different tables of ICU's.
// Throws Error where neither the library nor ICU knows it.
Answer lookUpPage(const std::string &asked);

// The library's tables: the numbers with names, and the Windows names.
Answer allPages();

} // namespace nls2::tool
