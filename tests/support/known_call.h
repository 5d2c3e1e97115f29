// Calls with a fault on request, whose whole trace is a known one.
#pragma once

#include "support/heap_probe.h"
#include "support/icu_probe.h"
#include "support/known_trace.h"
#include "support/live_locale.h"

#include <functional>
#include <sstream>

namespace support {

// What fails: "ucnv_open 1", the first call of that function, with status 7; "realloc 8", every one
// of 8 bytes; or nothing. Where the heap cannot refuse, the call is left out. The section ends in
// what the call answered, as "returned 2, status 0, left open 0" (converters).
inline void expectKnownCall(const std::string &section, const std::string &fault,
                            const Names &names,
                            const std::function<int32_t(int32_t *status)> &call) {
  std::string function;
  int number = 0;
  std::istringstream(fault) >> function >> number;
  const bool heap = function == "realloc";
  if (heap && !heapCanRefuse) {
    return;
  }
  const FailingConversion failing(function.c_str(), number);
  const FailingReallocs refused(heap ? static_cast<std::size_t>(number) : noSize);
  const Recording recording(traceAll);
  const ConverterMarks marks;
  const int before = openConverters();
  int32_t status = 99;
  const int32_t result = call(&status);
  mark("returned " + std::to_string(result) + ", status " + std::to_string(status) +
       ", left open " + std::to_string(openConverters() - before));
  expectKnownTrace(section, recording, names);
}

} // namespace support
