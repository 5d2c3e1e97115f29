// Names of languages and locales: NLS2_GetLanguageName, NLS2_GetShortPosixName,
// NLS2_LanguageIDFromShortPosixName.

#include "locale/locale_map.h"
#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <cstring>
#include <unicode/uloc.h>

using nls2::failed;
using nls2::trace::Frame;

int32_t NLS2_GetLanguageName(uint32_t languageId, char *nameBuffer, int32_t bufferLength) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_GetLanguageName");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: languageID %X, buflen %d.", languageId, bufferLength);
  NLS2_TRACE(frame, "Locate languageID %d in table.", languageId);
  const LocaleMapEntry *entry = nls2::locale::findLanguage(languageId);
  if (entry == nullptr) {
    NLS2_TRACE(frame, "Could not find matching languageID in table.");
    return frame.result(int32_t{NLS2_ERR_LANGUAGE_NOT_FOUND});
  }
  NLS2_TRACE(frame, "Found languageID in table.");
  UErrorCode status = U_ZERO_ERROR;
  uloc_getLanguage(entry->localeName, nameBuffer, bufferLength, &status);
  if (failed(status)) {
    NLS2_TRACE(frame, "Error %d retrieving language name from ICU.", status);
    return frame.result(int32_t{status});
  }
  return frame.result(0);
}

int32_t NLS2_GetShortPosixName(uint32_t languageId, char *nameBuffer, int32_t bufferLength) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_GetShortPosixName");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: languageID %X, buflen %d.", languageId, bufferLength);
  NLS2_TRACE(frame, "Locate name in the table.");
  const LocaleMapEntry *entry = nls2::locale::findLanguage(languageId);
  if (entry == nullptr) {
    return frame.result(int32_t{NLS2_ERR_LANGUAGE_NOT_FOUND});
  }
  NLS2_TRACE(frame, "Found matching languageID in the table.");
  std::strcpy(nameBuffer, entry->shortName);
  return frame.result(0);
}

uint32_t NLS2_LanguageIDFromShortPosixName(const char *pShortPosixName, int32_t *status) {
  static constinit TRC1_EntryBlock anchor =
      nls2::trace::anchorOf("NLS2_LanguageIDFromShortPosixName");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameter: pShortPosixName %s.", pShortPosixName);
  NLS2_TRACE(frame, "Locate matching Short Posix Name in the table.");
  const LocaleMapEntry *entry = nls2::locale::findEntry([=](const LocaleMapEntry &candidate) {
    return std::strcmp(candidate.shortName, pShortPosixName) == 0;
  });
  if (entry == nullptr) {
    NLS2_TRACE(frame, "No matching name in the table.");
    *status = NLS2_ERR_INVALID_PARAMETER;
    return frame.result(0U);
  }
  NLS2_TRACE(frame, "Found matching name in the table.");
  *status = U_ZERO_ERROR;
  return frame.result(entry->languageId);
}
