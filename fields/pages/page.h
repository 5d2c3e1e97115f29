// An open code page.
#pragma once

#include "nls2_fields.h"

#include <atomic>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

struct NLS2F_Page {
  static constexpr int32_t numberUnknown = -1;

  // It never converts, so that threads can share it: users clone it.
  const icu::LocalUConverterPointer converter;
  const bool hasSignature;
  mutable std::atomic<int32_t> number; // numberUnknown until somebody wants to know
};

namespace zelfields {

// A converter of one's own, in its initial state. The status may be a warning.
icu::LocalUConverterPointer cloneOf(const UConverter *converter, UErrorCode &error);

// Brings a converter to the beginning of a text.
UConverter *restart(icu::LocalUConverterPointer &converter);

} // namespace zelfields
