// NLS2_TranslateString: a field from one code page to another.

#include "convert/translation.h"

#include <cstring>

namespace {

using nls2::convert::Translation;
using nls2::trace::Frame;

constexpr uint32_t acceptedOptions =
    NLS2_STRING_TERMINATE | NLS2_STRING_FILL | NLS2_STRING_TRAILING | NLS2_STRING_STRIP_TRAILING;

bool optionsAllowed(const Frame &frame, uint32_t options) {
  if (options != 0 && (options & acceptedOptions) == 0) {
    NLS2_TRACE(frame, "Input options not allowed. %X.", options);
    return false;
  }
  NLS2_TRACE(frame, "Input options are %X.", options);
  return true;
}

bool parametersValid(const Frame &frame, int32_t destLen, int32_t sourceLen, int32_t sourceCodePage,
                     int32_t destCodePage) {
  if (destLen < 0 || (destLen == 0 && sourceLen != 0) || sourceCodePage == 0 || destCodePage == 0) {
    NLS2_TRACE(frame,
               "Invalid input parameter. destLen %d, sourceLen %d, sourceCodePage %d, "
               "destCodePage %d",
               destLen, sourceLen, sourceCodePage, destCodePage);
    return false;
  }
  NLS2_TRACE(frame,
             "Input parameters. destLen %d, sourceLen %d, sourceCodePage %d, destCodePage %d",
             destLen, sourceLen, sourceCodePage, destCodePage);
  return true;
}

void traceSource(const Frame &frame, const char *source, int32_t sourceLen) {
  if (!frame.detail()) {
    return;
  }
  if (sourceLen > 0) {
    frame.dump(source, static_cast<uint32_t>(sourceLen));
  } else if (sourceLen < 0) {
    frame.dump(source, static_cast<uint32_t>(std::strlen(source)));
  } else {
    NLS2_TRACE(frame, "Input source length is zero.");
  }
}

// Opens both converters; of the two-null flags only the destination's is kept.
bool openConverters(Translation &call, int32_t sourceCodePage, int32_t destCodePage) {
  int32_t status = U_ZERO_ERROR;
  int32_t sourceTwoNull = 0;
  call.sourceConverter.adoptInstead(
      NLS2_MapCodepageIdToName(sourceCodePage, &sourceTwoNull, &status));
  if (status > U_ZERO_ERROR) {
    NLS2_TRACE(call.frame, "Error getting a source codepage converter %d.", status);
    *call.pStatus = status;
    return false;
  }
  call.destConverter.adoptInstead(
      NLS2_MapCodepageIdToName(destCodePage, &call.twoNullTerminator, &status));
  if (status > U_ZERO_ERROR) {
    NLS2_TRACE(call.frame, "Error getting a destination codepage converter %d.", status);
    *call.pStatus = status;
    return false;
  }
  return true;
}

} // namespace

int32_t NLS2_TranslateString(int32_t destCodePage, char *dest, int32_t destLen,
                             int32_t sourceCodePage, const char *source, int32_t sourceLen,
                             int32_t *pSourceConsumed, uint32_t options, int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_TranslateString");
  Frame frame(anchor);
  *pStatus = U_ZERO_ERROR;
  *pSourceConsumed = 0;
  if (!optionsAllowed(frame, options) ||
      !parametersValid(frame, destLen, sourceLen, sourceCodePage, destCodePage)) {
    *pStatus = NLS2_ERR_INVALID_PARAMETER;
    return frame.result(0);
  }
  traceSource(frame, source, sourceLen);
  if (sourceLen == 0) {
    return frame.result(0);
  }
  Translation call{frame, dest, destLen, source, sourceLen, options, pSourceConsumed, pStatus};
  if (!openConverters(call, sourceCodePage, destCodePage)) {
    return frame.result(0);
  }
  const bool direct = options == 0 || options == NLS2_STRING_TERMINATE;
  return frame.result(direct ? translateDirectly(call) : translateWithPadding(call));
}
