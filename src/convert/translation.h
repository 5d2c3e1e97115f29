// What the two paths of NLS2_TranslateString share.
#pragma once

#include "nls2.h"
#include "trace/frame.h"

#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace nls2::convert {

// One call, its arguments past their checks and its converters open.
struct Translation {
  trace::Frame &frame;
  char *dest;
  int32_t destLen;
  const char *source;
  int32_t sourceLen;
  uint32_t options;
  int32_t *pSourceConsumed;
  int32_t *pStatus;
  icu::LocalUConverterPointer destConverter{};
  icu::LocalUConverterPointer sourceConverter{}; // declared last, closed first
  int32_t twoNullTerminator = 0;                 // the destination page's

  bool has(uint32_t option) const { return (options & option) != 0; }
  int32_t terminatorLength() const { return twoNullTerminator != 0 ? 2 : 1; }
  int32_t fail(int32_t status) const {
    *pStatus = status;
    return 0;
  }
  void closeConverters() {
    sourceConverter.adoptInstead(nullptr);
    destConverter.adoptInstead(nullptr);
  }
  // ICU's warnings are no failures.
  static bool failed(UErrorCode status) { return status > U_ZERO_ERROR; }
};

// Converts the source as it is. The result is the function's.
int32_t translateDirectly(Translation &call);

// Converts the source through a UTF-16 work buffer, in which its trailing blanks are cut off and
// the blanks asked for are put on. The result is the function's.
int32_t translateWithPadding(Translation &call);

} // namespace nls2::convert
