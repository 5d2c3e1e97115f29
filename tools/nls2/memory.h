// Whether ICU ran out of memory: some of its functions report that as a name that is unknown, or not
// at all.
#pragma once

namespace nls2::tool {

// Must come before any other use of ICU.
void watchMemory();

// Throws std::bad_alloc where a request of ICU's has failed since then. To be called before an answer
// is given.
void requireMemory();

} // namespace nls2::tool
