// Resource bundles: NLS2_ResourceOpen, NLS2_ResourceClose, NLS2_GetStringByKey.

#include "locale/registry.h"
#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <unicode/ures.h>

using nls2::failed;
using nls2::trace::Frame;

UResourceBundle *NLS2_ResourceOpen(const char *packageName, const NLS2_Locale *pLocale,
                                   int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_ResourceOpen");
  Frame frame(anchor);
  if (failed(nls2::locale::validateLocale(pLocale))) {
    *pStatus = NLS2_ERR_INVALID_LOCALE;
    return frame.result(static_cast<UResourceBundle *>(nullptr));
  }
  UErrorCode status = U_ZERO_ERROR;
  UResourceBundle *bundle = ures_open(packageName, pLocale->icuLocale, &status);
  *pStatus = status;
  return frame.result(bundle);
}

void NLS2_ResourceClose(UResourceBundle *bundle) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_ResourceClose");
  const Frame frame(anchor);
  ures_close(bundle);
}

const UChar *NLS2_GetStringByKey(const UResourceBundle *bundle, const char *key, int32_t *pLength,
                                 int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_GetStringByKey");
  Frame frame(anchor);
  *pStatus = U_ZERO_ERROR;
  UErrorCode status = U_ZERO_ERROR;
  const UChar *string = ures_getStringByKey(bundle, key, pLength, &status);
  NLS2_TRACE(frame, "Get String by Key results %d", status);
  *pStatus = status;
  return frame.result(string);
}
