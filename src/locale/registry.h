// The registry of live locale objects: the list behind pLocaleObjectList.
#pragma once

#include "nls2.h"
#include "trace/frame.h"

namespace nls2::locale {

// Links an object at the list's end.
void append(trace::Trace trace, NLS2_Locale *object);

// Unlinks and frees an object. Frees nothing where another thread was faster.
void remove(trace::Trace trace, NLS2_Locale *object);

// True while the object is on the list; its contents are not looked at. Takes no lock.
bool contains(const NLS2_Locale *object);

} // namespace nls2::locale
