// The commands of nls2: one function for each, and the list of them.
#pragma once

#include "options.h"

namespace nls2::tool {

Command catCommand();
Command codepagesCommand();
Command compareCommand();
Command detectCommand();
Command dumpCommand();
Command findCommand();
Command localesCommand();
Command sortCommand();
Command translateCommand();

} // namespace nls2::tool
