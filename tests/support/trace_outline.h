// A recorded trace as a short text, for comparing whole sequences of one call.
#pragma once

#include "support/recording_host.h"

#include <string>
#include <utility>
#include <vector>

namespace support {

// Pointers and the names that stand for them in an outline.
using Names = std::vector<std::pair<const void *, std::string>>;

// The lines of the outermost function, one call of another function a line, in this form:
//   > NLS2_Outer             entry              NLS2_Inner = 38     a call within, by its exit
//   : detail text            a detail line      NLS2_Inner =        the same without a value
//   = 0   or   =             exit event         lock, unlock        of LocaleObjectList_Lock
// Other marks of the outermost function stand as they are. Pointers named in `names` print as
// {name}, null as 0. What breaks the nesting of entries and exits prints as "!! line".
std::string outline(const Recording &recording, const Names &names = {});

// The text with each `mark` replaced; for expectations that repeat a name.
std::string filled(std::string text, const std::string &mark, const std::string &with);

} // namespace support
