// The registry of live locale objects: the list that pLocaleObjectList begins.
#pragma once

#include "locale/remembered.h"
#include "nls2.h"
#include "trace/frame.h"

namespace nls2::locale {

// Links an object at the list's end.
void append(trace::Trace trace, NLS2_Locale *object);

// Unlinks and frees an object. Does nothing if another thread already removed it.
void remove(trace::Trace trace, NLS2_Locale *object);

// True while the object is on the list; its contents are not read. Takes no lock.
bool contains(const NLS2_Locale *object);

// NLS2_ValidateLocale in its trace frame.
int32_t validateInFrame(TRC1_EntryBlock &anchor, const NLS2_Locale *pLocale);

// NLS2_ValidateLocale, compiled into hot callers: while tracing is off and the thread remembers the
// object, there is nothing else to do.
[[gnu::always_inline]] inline int32_t validateLocale(const NLS2_Locale *pLocale) {
  static constinit TRC1_EntryBlock anchor = trace::anchorOf("NLS2_ValidateLocale");
  if (trace::Frame::isOff(anchor) && isRemembered(pLocale)) [[likely]] {
    return 0;
  }
  return validateInFrame(anchor, pLocale);
}

} // namespace nls2::locale
