// The padding path of NLS2_TranslateString.
#pragma once

#include "nls2.h"
#include "trace/frame.h"

#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace nls2::convert {

// Lengths in bytes; a negative sourceLen means a null-terminated source.
struct Buffers {
  char *dest;
  int32_t destLen;
  const char *source;
  int32_t sourceLen;
};

// One call, with checked arguments and open converters.
struct PaddedTranslation {
  trace::Trace trace;
  Buffers buffers;
  uint32_t options;
  int32_t *pStatus;
  bool twoNullTerminator; // of the destination's code page
  icu::LocalUConverterPointer destConverter;
  icu::LocalUConverterPointer sourceConverter; // declared last, closed first

  bool has(uint32_t option) const { return (options & option) != 0; }
  int32_t terminatorLength() const { return twoNullTerminator ? 2 : 1; }
  // Returns false, for a step to return in turn.
  bool fail(int32_t status) const {
    *pStatus = status;
    return false;
  }
  void closeConverters() {
    sourceConverter.adoptInstead(nullptr);
    destConverter.adoptInstead(nullptr);
  }
};

// Converts the source through a UTF-16 work buffer, in which its trailing blanks are cut off and
// the requested blanks are appended. Returns NLS2_TranslateString's result.
int32_t translateWithPadding(PaddedTranslation &call);

} // namespace nls2::convert
