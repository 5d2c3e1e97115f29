// NLS2_TranslateString: a field from one code page to another; its checks and its direct path.

#include "codepage/codepage_mapping.h"
#include "convert/padding.h"
#include "nls2.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <cstddef>
#include <cstring>
#include <utility>

namespace {

using icu::LocalUConverterPointer;
using nls2::failed;
using nls2::codepage::mapCodepageIdToName;
using nls2::convert::Buffers;
using nls2::convert::PaddedTranslation;
using nls2::trace::Trace;

constexpr uint32_t acceptedOptions =
    NLS2_STRING_TERMINATE | NLS2_STRING_FILL | NLS2_STRING_TRAILING | NLS2_STRING_STRIP_TRAILING;

bool optionsAllowed(Trace trace, uint32_t options) {
  if (options != 0 && (options & acceptedOptions) == 0) {
    NLS2_TRACE(trace, "Input options not allowed. %X.", options);
    return false;
  }
  NLS2_TRACE(trace, "Input options are %X.", options);
  return true;
}

bool parametersValid(Trace trace, int32_t destLen, int32_t sourceLen, int32_t sourceCodePage,
                     int32_t destCodePage) {
  if (destLen < 0 || (destLen == 0 && sourceLen != 0) || sourceCodePage == 0 || destCodePage == 0) {
    NLS2_TRACE(trace,
               "Invalid input parameter. destLen %d, sourceLen %d, sourceCodePage %d, "
               "destCodePage %d",
               destLen, sourceLen, sourceCodePage, destCodePage);
    return false;
  }
  NLS2_TRACE(trace,
             "Input parameters. destLen %d, sourceLen %d, sourceCodePage %d, destCodePage %d",
             destLen, sourceLen, sourceCodePage, destCodePage);
  return true;
}

std::size_t sourceLength(const char *source, int32_t sourceLen) {
  return sourceLen >= 0 ? static_cast<std::size_t>(sourceLen) : std::strlen(source);
}

void traceSource(Trace trace, const char *source, int32_t sourceLen) {
  if (!trace.detail()) {
    return;
  }
  if (sourceLen == 0) {
    NLS2_TRACE(trace, "Input source length is zero.");
  } else {
    trace.dump(source, static_cast<uint32_t>(sourceLength(source, sourceLen)));
  }
}

// The terminator's first null byte is ICU's; the second one of a two-null page is stored here,
// without a check of the destination's size.
int32_t countTerminator(Trace trace, char *dest, int32_t amountWritten, bool twoNull) {
  if (twoNull) {
    dest[amountWritten + 1] = 0;
    // Unsigned, because the sum may exceed 2 GB.
    amountWritten = static_cast<int32_t>(static_cast<uint32_t>(amountWritten) + 2U);
    NLS2_TRACE(trace, "Amount written includes utf-16 nulls %d.", amountWritten);
  } else {
    amountWritten += 1;
    NLS2_TRACE(trace, "Amount written includes one null.  %d.", amountWritten);
  }
  return amountWritten;
}

// Options 0 and NLS2_STRING_TERMINATE alone: the source as it is. Closes both converters. Inline
// and with separate arguments: a struct, as the padding path has, goes through memory, which costs
// 3 to 8 ns a call, up to 3 % of a short translation (measured).
inline int32_t translateDirectly(Trace trace, Buffers buffers,
                                 LocalUConverterPointer &destConverter,
                                 LocalUConverterPointer &sourceConverter, uint32_t options,
                                 bool twoNull, int32_t *pSourceConsumed, int32_t *pStatus) {
  NLS2_TRACE(trace, "Option specified %X.  Translate the input buffer directly", options);
  const auto [dest, destLen, source, sourceLen] = buffers;
  char *target = dest;
  const char *cursor = source;
  UErrorCode status = U_ZERO_ERROR;
  ucnv_convertEx(destConverter.getAlias(), sourceConverter.getAlias(), &target, dest + destLen,
                 &cursor, source + sourceLength(source, sourceLen), nullptr, nullptr, nullptr,
                 nullptr, true, true, &status);
  if (failed(status)) {
    NLS2_TRACE(trace, "Error converting string %d.", status);
    *pStatus = status;
    return 0;
  }
  sourceConverter.adoptInstead(nullptr);
  destConverter.adoptInstead(nullptr);
  *pSourceConsumed = static_cast<int32_t>(cursor - source);
  NLS2_TRACE(trace, "Conversion successful");
  auto amountWritten = static_cast<int32_t>(target - dest);
  if (status != U_STRING_NOT_TERMINATED_WARNING) {
    NLS2_TRACE(trace, "Account for extra nulls, if required.");
    if (options == NLS2_STRING_TERMINATE || sourceLen == -1) {
      amountWritten = countTerminator(trace, dest, amountWritten, twoNull);
    }
  }
  NLS2_TRACE(trace, "Output parameters. destLen %d,amountWritten %d", destLen, amountWritten);
  trace.dump(dest, static_cast<uint32_t>(amountWritten));
  return amountWritten;
}

} // namespace

int32_t NLS2_TranslateString(int32_t destCodePage, char *dest, int32_t destLen,
                             int32_t sourceCodePage, const char *source, int32_t sourceLen,
                             int32_t *pSourceConsumed, uint32_t options, int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_TranslateString");
  nls2::trace::Frame frame(anchor);
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

  // Only the destination page's two-null flag counts.
  int32_t twoNull = 0;
  int32_t status = U_ZERO_ERROR;
  LocalUConverterPointer sourceConverter(mapCodepageIdToName(sourceCodePage, &twoNull, &status));
  if (failed(status)) {
    NLS2_TRACE(frame, "Error getting a source codepage converter %d.", status);
    *pStatus = status;
    return frame.result(0);
  }
  LocalUConverterPointer destConverter(mapCodepageIdToName(destCodePage, &twoNull, &status));
  if (failed(status)) {
    NLS2_TRACE(frame, "Error getting a destination codepage converter %d.", status);
    *pStatus = status;
    return frame.result(0);
  }

  const Buffers buffers{dest, destLen, source, sourceLen};
  if (options == 0 || options == NLS2_STRING_TERMINATE) {
    return frame.result(translateDirectly(frame, buffers, destConverter, sourceConverter, options,
                                          twoNull != 0, pSourceConsumed, pStatus));
  }
  PaddedTranslation call{frame,
                         buffers,
                         options,
                         pStatus,
                         twoNull != 0,
                         std::move(destConverter),
                         std::move(sourceConverter)};
  return frame.result(nls2::convert::translateWithPadding(call));
}
