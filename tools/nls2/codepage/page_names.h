// Names of code pages: which numbers and converters they stand for, and names near to them.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace nls2::tool {

// The numbers that nls2.h lists as opened by name; what they open, the library is asked.
inline constexpr std::array<int32_t, 25> pagesWithNames{
    874,   932,   936,   949,   950,   1200,  1208,  57352, 57355, 57356, 57357, 57358, 57359,
    57360, 57361, 57362, 57363, 57365, 57366, 57367, 57368, 57369, 57370, 57371, 57372};

// ICU's canonical name of what the library opens for a number, or ICU for a name; nothing where it
// does not open, or has no name.
std::optional<std::string> converterOf(int32_t number);
std::optional<std::string> converterOf(const std::string &name);

// The number of a name as NLS2_GetCodepageId has it.
std::optional<int32_t> ccsidOf(const std::string &name);

// The library's Windows names: all of a number, and the number of exactly this name.
std::vector<std::string> windowsNamesOf(int32_t number);
std::optional<int32_t> windowsPage(const std::string &name);

// The converters of ICU's that have this name, where it means several tables; else none.
std::vector<std::string> meaningsOf(const std::string &name);

// The number that opens what ICU opens for the name: that of the library's Windows name, else the
// CCSID or one of the numbers with names. Nothing where there is none, or the name means several
// tables.
std::optional<int32_t> numberOf(const std::string &name);

// All names: ICU's converters with their aliases, and the library's Windows names.
std::vector<std::string> allPageNames();
// Those that numberOf() finds a number for, sorted.
std::vector<std::string> namesWithNumbers();

// " (did you mean cp037?)" for a name that is unknown, or a number that has a Windows name.
std::string nearPages(const std::string &asked);

} // namespace nls2::tool
