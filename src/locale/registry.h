// The registry of live locale objects: the list behind pLocaleObjectList.
#pragma once

#include "locale/walkers.h"
#include "nls2.h"
#include "trace/frame.h"

namespace nls2::locale {

// Links an object at the list's end.
void append(trace::Trace trace, NLS2_Locale *object);

// Unlinks and frees an object. Does nothing if another thread already removed it.
void remove(trace::Trace trace, NLS2_Locale *object);

// A link of the list. Links are read by walks that take no lock; that they are sequentially
// consistent with the counts of walkers.h is what makes a removal see every walk that can still see
// the removed object. A load pays nothing for it on x86 and little elsewhere.
inline NLS2_Locale *follow(NLS2_Locale *const &link) {
  return __atomic_load_n(&link, __ATOMIC_SEQ_CST);
}

// True while the object is on the list; its contents are not looked at. Takes no lock.
inline bool contains(const NLS2_Locale *object) {
  const Walk walk;
  const NLS2_Locale *node = follow(pLocaleObjectList);
  while (node != nullptr && node != object) {
    node = follow(node->pNext);
  }
  return node != nullptr;
}

// The whole of NLS2_ValidateLocale, its trace frame included, to be compiled into callers that
// count nanoseconds.
[[gnu::always_inline]] inline int32_t validateLocale(const NLS2_Locale *pLocale) {
  static constinit TRC1_EntryBlock anchor = trace::anchorOf("NLS2_ValidateLocale");
  trace::Frame frame(anchor);
  if (!contains(pLocale)) {
    NLS2_TRACE(frame, "Could not find locale on linked-list.");
    return frame.result(int32_t{NLS2_ERR_INVALID_LOCALE});
  }
  NLS2_TRACE(frame, "Locale successfully found on linked-list.");
  return frame.result(0);
}

} // namespace nls2::locale
