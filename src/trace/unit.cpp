// The trace unit block, the sync word and the cold half of the frame.

#include "trace/frame.h"

#include "nls2.h"

namespace nls2::trace {

// The date and time are fixed texts of the interface; NLS2_BuildStamp tells the true ones.
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

void Frame::line(const char *text, uint32_t line) const {
  if (detail()) {
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-security"
#pragma GCC diagnostic ignored "-Wformat-nonliteral"
    TRC1_Printf(&anchor_, line, text);
#pragma GCC diagnostic pop
  }
}

void Frame::leave() const {
  if (exitKind_ == TRC1_EVENT_EXIT_VALUE) {
    TRC1_Event(&anchor_, exitLine_, TRC1_EVENT_EXIT_VALUE, exitValue_);
  } else {
    TRC1_Event(&anchor_, exitLine_, TRC1_EVENT_EXIT);
  }
}

} // namespace nls2::trace
