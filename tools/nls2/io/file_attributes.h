// What a file keeps when another takes its place: owner, mode, access list, extended attributes.
#pragma once

#include <string>
#include <sys/stat.h>

namespace nls2::tool {

// Gives the file `fd` the attributes of the one at `path`, as far as that is allowed. The file is
// never open to more users than the other one. Throws Error.
void copyAttributes(const std::string &path, const struct stat &facts, int fd);

} // namespace nls2::tool
