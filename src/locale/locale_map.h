// Searching localeMap.
#pragma once

#include "nls2.h"

namespace nls2::locale {

// The first record for which `matches` is true; null if there is none before the terminator.
template <class Matches>
const LocaleMapEntry *findEntry(Matches matches) {
  for (const LocaleMapEntry *entry = localeMap; entry->languageId != NLS2_LANGUAGE_ID_END;
       ++entry) {
    if (matches(*entry)) {
      return entry;
    }
  }
  return nullptr;
}

inline const LocaleMapEntry *findLanguage(uint32_t languageId) {
  return findEntry([=](const LocaleMapEntry &entry) { return entry.languageId == languageId; });
}

// The first record whose locale name occurs anywhere in the text.
const LocaleMapEntry *findNameInside(const char *text);

} // namespace nls2::locale
