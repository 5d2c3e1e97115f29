// What the library and ICU make of one code page.
#pragma once

#include <array>
#include <cstdint>
#include <nlohmann/json.hpp>
#include <string>

namespace nls2::tool {

// The numbers that nls2.h lists as opened by name; what they open, the library is asked.
inline constexpr std::array<int32_t, 25> pagesWithNames{
    874,   932,   936,   949,   950,   1200,  1208,  57352, 57355, 57356, 57357, 57358, 57359,
    57360, 57361, 57362, 57363, 57365, 57366, 57367, 57368, 57369, 57370, 57371, 57372};

// Whether the number opens, and as what. Fields that depend on a converter are null without one.
nlohmann::ordered_json describeCodepage(int32_t number);

// The numbers that a name stands for, or the number given, and the names that people write for it;
// `tablesDiffer` tells whether they open different tables of ICU's. Throws Error where neither
// the library nor ICU knows what was asked for.
nlohmann::ordered_json lookUpCodepage(const std::string &asked);
std::string foundCodepageAsText(const nlohmann::ordered_json &found);

// A description in lines, each ended by a newline.
std::string descriptionAsText(const nlohmann::ordered_json &description);

} // namespace nls2::tool
