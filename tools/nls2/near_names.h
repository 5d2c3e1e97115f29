// Names near to one that is unknown.
#pragma once

#include <string>
#include <vector>

namespace nls2::tool {

// Up to `most` of the known names that are nearest and differ in few letters; case does not count.
std::vector<std::string> nearNames(const std::string &unknown,
                                   const std::vector<std::string> &known, std::size_t most = 3);

// " (did you mean a, b or c?)" for the end of a message; empty without names.
std::string didYouMean(const std::vector<std::string> &names);

} // namespace nls2::tool
