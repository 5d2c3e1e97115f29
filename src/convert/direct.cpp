// The direct path of NLS2_TranslateString: options 0 and NLS2_STRING_TERMINATE alone.

#include "convert/translation.h"

#include <cstddef>
#include <cstring>

namespace nls2::convert {

namespace {

// Counts the null byte that ICU wrote behind the output; a two-null page gets its second one here,
// without a look at the destination's size.
int32_t countTerminator(const Translation &call, int32_t amountWritten) {
  NLS2_TRACE(call.frame, "Account for extra nulls, if required.");
  if (call.options != NLS2_STRING_TERMINATE && call.sourceLen != -1) {
    return amountWritten;
  }
  if (call.twoNullTerminator != 0) {
    call.dest[amountWritten + 1] = 0;
    amountWritten += 2;
    NLS2_TRACE(call.frame, "Amount written includes utf-16 nulls %d.", amountWritten);
  } else {
    amountWritten += 1;
    NLS2_TRACE(call.frame, "Amount written includes one null.  %d.", amountWritten);
  }
  return amountWritten;
}

} // namespace

int32_t translateDirectly(Translation &call) {
  NLS2_TRACE(call.frame, "Option specified %X.  Translate the input buffer directly", call.options);
  char *target = call.dest;
  const char *source = call.source;
  const std::size_t length =
      call.sourceLen >= 0 ? static_cast<std::size_t>(call.sourceLen) : std::strlen(call.source);
  UErrorCode status = U_ZERO_ERROR;
  ucnv_convertEx(call.destConverter.getAlias(), call.sourceConverter.getAlias(), &target,
                 call.dest + call.destLen, &source, call.source + length, nullptr, nullptr, nullptr,
                 nullptr, true, true, &status);
  if (Translation::failed(status)) {
    NLS2_TRACE(call.frame, "Error converting string %d.", status);
    return call.fail(status);
  }
  call.closeConverters();
  *call.pSourceConsumed = static_cast<int32_t>(source - call.source);
  NLS2_TRACE(call.frame, "Conversion successful");
  auto amountWritten = static_cast<int32_t>(target - call.dest);
  if (status != U_STRING_NOT_TERMINATED_WARNING) {
    amountWritten = countTerminator(call, amountWritten);
  }
  NLS2_TRACE(call.frame, "Output parameters. destLen %d,amountWritten %d", call.destLen,
             amountWritten);
  call.frame.dump(call.dest, static_cast<uint32_t>(amountWritten));
  return amountWritten;
}

} // namespace nls2::convert
