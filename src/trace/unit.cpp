// The trace unit block and the sync word.

#include "trace/frame.h"

#include "nls2.h"

namespace nls2::trace {

// The date and time are fixed texts of the interface; NLS2_BuildStamp reports the true ones.
constinit TRC1_UnitBlock unit = {
    .formatVersion = 400,
    .attributes = 0x30000000,
    .fileName = "nls2.cpp",
    .fileNameLength = 8,
    .buildDate = "Mar  9 2007",
    .buildDateLength = 11,
    .buildTime = "19:13:31",
    .buildTimeLength = 8,
    .level = "100",
    .levelLength = 3,
    .mark = "*",
    .markLength = 1,
    .reserved = {0, 0},
    .buildStamp = NLS2_BuildStamp,
};

constinit uint32_t syncWord = 1;

} // namespace nls2::trace
