// Names and numbers of code pages: NLS2_GetCodepageName, NLS2_GetCodepageId.

#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <cstring>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using nls2::failed;
using nls2::trace::Frame;
using nls2::trace::Trace;

// Leaks a converter that has no CCSID, and no record for its name: the library always did, and
// callers that count converters rely on it.
void leaveOpen(icu::LocalUConverterPointer &converter) { converter.orphan(); }

// Called only under detail tracing. A failure then ends the query, so tracing can change its
// result.
UErrorCode traceCcsid(Trace trace, const UConverter *converter) {
  UErrorCode error = U_ZERO_ERROR;
  const int32_t ccsid = ucnv_getCCSID(converter, &error);
  NLS2_TRACE(trace, "CCSID for this converter is %d", ccsid);
  if (failed(error)) {
    NLS2_TRACE(trace, "Error retrieving CCSID for converter %X.", nls2::trace::low32(converter));
  }
  return error;
}

} // namespace

int32_t NLS2_GetCodepageName(int32_t codepageId, char *nameBuffer, uint32_t /*bufferLength*/) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_GetCodepageName");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: CodePageID %d", codepageId);
  int32_t twoNull = 0;
  int32_t status = U_ZERO_ERROR;
  icu::LocalUConverterPointer converter(NLS2_MapCodepageIdToName(codepageId, &twoNull, &status));
  if (failed(status)) {
    NLS2_TRACE(frame, "ICU converter for codepage not found.%d", status);
    return frame.result(status);
  }
  if (frame.detail()) {
    const UErrorCode error = traceCcsid(frame, converter.getAlias());
    if (failed(error)) {
      return frame.result(int32_t{error});
    }
  }
  UErrorCode error = U_ZERO_ERROR;
  const char *name = ucnv_getName(converter.getAlias(), &error);
  if (failed(error) || name == nullptr) {
    NLS2_TRACE(frame, "Converter codepage name not found.");
    return frame.result(int32_t{failed(error) ? error : U_MISSING_RESOURCE_ERROR});
  }
  NLS2_TRACE(frame, "Codepage name %s found.", name);
  std::strcpy(nameBuffer, name); // before the close: the name of 57365 is freed with its converter
  NLS2_TRACE(frame, "Release converter %X.", nls2::trace::low32(converter.getAlias()));
  converter.adoptInstead(nullptr);
  NLS2_TRACE(frame, "Copy codepage name %s to user buffer.", nameBuffer);
  NLS2_TRACE(frame, "Compute length of name.");
  NLS2_TRACE(frame, "Name length is %d.", static_cast<int>(std::strlen(nameBuffer)));
  return frame.result(0);
}

uint32_t NLS2_GetCodepageId(const char *codepageName, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_GetCodepageId");
  Frame frame(anchor);
  const char *shownName = nls2::trace::text(codepageName);
  NLS2_TRACE(frame, "Input parameters: CodePageName %s.", shownName);
  NLS2_TRACE(frame, "Getting codepage id from codepage name %s.", shownName);
  *status = U_ZERO_ERROR;
  NLS2_TRACE(frame, "Opening ICU converter for codepage name %s.", shownName);
  UErrorCode error = U_ZERO_ERROR;
  icu::LocalUConverterPointer converter(ucnv_open(codepageName, &error));
  if (failed(error)) {
    NLS2_TRACE(frame, "Could not open ICU converter based on codepage name.");
    *status = error;
    return frame.result(0U);
  }
  NLS2_TRACE(frame, "ICU converter allocated.");
  NLS2_TRACE(frame, "Retrieve the CCSID for this converter.");
  error = U_ZERO_ERROR;
  auto codepage = static_cast<uint32_t>(ucnv_getCCSID(converter.getAlias(), &error));
  if (failed(error)) {
    NLS2_TRACE(frame, "CCSID number not found for Codepage name.");
    *status = error;
    return frame.result(0U);
  }
  if (codepage == 0) {
    NLS2_TRACE(frame, "ICU cannot find a CCSID for this codepage named %s", shownName);
    int32_t searchStatus = U_ZERO_ERROR;
    codepage = NLS2_MapWindowsNameToCCSID(shownName, &searchStatus);
    if (failed(searchStatus)) {
      NLS2_TRACE(frame, "Codepage name is not CCSID nor Windows.");
      *status = NLS2_ERR_INVALID_PARAMETER;
      leaveOpen(converter);
      return frame.result(0U);
    }
  }
  converter.adoptInstead(nullptr);
  NLS2_TRACE(frame, "CCSID associated with the codepage name is %d.", codepage);
  return frame.result(codepage);
}
