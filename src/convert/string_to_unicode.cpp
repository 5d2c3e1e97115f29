// A locale's code page and UTF-8 between two open converters: NLS2_StringToUnicode,
// NLS2_UnicodeToString.

#include "codepage/locale_converter.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/bounded_text.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <new>
#include <optional>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using icu::LocalUConverterPointer;
using nls2::failed;
using nls2::trace::BoundedText;
using nls2::trace::Frame;
using nls2::trace::low32;

constexpr const char *utf8 = "utf-8";

// What a length says need not lie in the buffer it belongs to, so no pointer arithmetic here: ICU
// compares the addresses and refuses what does not fit.
template <class Pointer>
Pointer limitOf(Pointer start, int32_t length) {
  return reinterpret_cast<Pointer>(reinterpret_cast<std::uintptr_t>(start) +
                                   static_cast<std::uintptr_t>(std::intptr_t{length}));
}

struct Ranges {
  char *output;
  char *outputLimit;
  const char *input;
  const char *inputLimit;
};

// The result is how far the output's end is from the input's.
int32_t convert(UConverter *to, UConverter *from, Ranges &ranges, UErrorCode &error) {
  ucnv_convertEx(to, from, &ranges.output, ranges.outputLimit, &ranges.input, ranges.inputLimit,
                 nullptr, nullptr, nullptr, nullptr, true, true, &error);
  return static_cast<int32_t>(reinterpret_cast<std::intptr_t>(ranges.output) -
                              reinterpret_cast<std::intptr_t>(ranges.input));
}

// UTF-8 to UTF-8 in a copy of the source, of which the output before the limit goes back: where
// bytes that are not valid grow to U+FFFD and the output overtakes the input, ICU writes up to 4
// bytes past the limit. No result if ICU is to refuse the ranges, or without memory for a copy.
std::optional<int32_t> convertUtf8InCopy(UConverter *to, UConverter *from, const Ranges &ranges,
                                         UErrorCode &error) {
  constexpr std::size_t overrun = 16;
  constexpr std::uintptr_t longest = INT32_MAX;
  const auto start = reinterpret_cast<std::uintptr_t>(ranges.input);
  const auto size = reinterpret_cast<std::uintptr_t>(ranges.inputLimit) - start;
  const auto given = reinterpret_cast<std::uintptr_t>(ranges.outputLimit) - start;
  if (size > longest || given > longest) {
    return std::nullopt;
  }
  const std::size_t room = std::min(given, 3 * size + 1); // enough for U+FFFD a byte
  const std::size_t bytes = std::max(room, size) + overrun;
  const std::unique_ptr<char[]> copy(new (std::nothrow) char[bytes]);
  if (!copy) {
    return std::nullopt;
  }
  std::memset(std::copy_n(ranges.input, size, copy.get()), 0, bytes - size);
  Ranges inCopy{copy.get(), copy.get() + room, copy.get(), copy.get() + size};
  const int32_t distance = convert(to, from, inCopy, error);
  // ICU puts a null after the output.
  const auto written =
      static_cast<std::size_t>(inCopy.output - copy.get()) + (failed(error) ? 0 : 1);
  std::copy_n(copy.get(), std::min(written, room), ranges.output);
  return distance;
}

// Converts from the source to the source: the output starts where the input does and may go on to
// dest + dlen.
int32_t convertInPlace(UConverter *to, UConverter *from, char *dest, int32_t dlen, const char *src,
                       int32_t slen, UErrorCode &error) {
  Ranges ranges{const_cast<char *>(src), limitOf(dest, dlen), src, limitOf(src, slen)};
  if (ucnv_getType(to) == UCNV_UTF8 && ucnv_getType(from) == UCNV_UTF8) {
    if (const auto distance = convertUtf8InCopy(to, from, ranges, error)) {
      return *distance;
    }
  }
  return convert(to, from, ranges, error);
}

} // namespace

int32_t NLS2_StringToUnicode(const NLS2_Locale *pLocale, char *dest, int32_t dlen, const char *src,
                             int32_t slen, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_StringToUnicode");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, dest %s, dlen %d, src %s, slen2%d.",
             low32(pLocale), BoundedText(dest, std::max(dlen, 0)).c_str(), dlen,
             BoundedText(src, slen).c_str(), slen);
  *status = U_ZERO_ERROR;
  if (failed(nls2::locale::validateLocale(pLocale))) {
    *status = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0);
  }
  UErrorCode error = U_ZERO_ERROR;
  const LocalUConverterPointer codepage(nls2::codepage::openAsCcsid(pLocale, &error));
  if (failed(error)) {
    NLS2_TRACE(frame, "Error opening source code converter. %d", error);
    *status = error;
    return frame.result(0);
  }
  error = U_ZERO_ERROR;
  const LocalUConverterPointer unicode(ucnv_open(utf8, &error));
  if (failed(error)) {
    NLS2_TRACE(frame, "Error opening UTF-8 Converter. %d", error);
    *status = error;
    return frame.result(0);
  }
  error = U_ZERO_ERROR;
  const int32_t distance =
      convertInPlace(unicode.getAlias(), codepage.getAlias(), dest, dlen, src, slen, error);
  if (failed(error)) {
    NLS2_TRACE(frame, "Could not map source codepage id to name. %d", error);
    *status = error;
    return frame.result(0);
  }
  return frame.result(distance);
}

int32_t NLS2_UnicodeToString(const NLS2_Locale *pLocale, char *dest, int32_t dlen, const char *src,
                             int32_t slen, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_UnicodeToString");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, dest %s, dlen %d, src %s, slen %d.",
             low32(pLocale), BoundedText(dest, std::max(dlen, 0)).c_str(), dlen,
             BoundedText(src, slen).c_str(), slen);
  *status = U_ZERO_ERROR;
  if (failed(nls2::locale::validateLocale(pLocale))) {
    *status = NLS2_ERR_INVALID_LOCALE;
    return frame.result(0);
  }
  UErrorCode error = U_ZERO_ERROR;
  const LocalUConverterPointer unicode(ucnv_open(utf8, &error));
  if (failed(error)) {
    *status = error;
    return frame.result(0);
  }
  error = U_ZERO_ERROR;
  const LocalUConverterPointer codepage(nls2::codepage::openAsCcsid(pLocale, &error));
  if (failed(error)) {
    NLS2_TRACE(frame, "Could not open CCSID converter for codepage %d", pLocale->codepage);
    *status = error;
    return frame.result(0);
  }
  error = U_ZERO_ERROR;
  const int32_t distance =
      convertInPlace(codepage.getAlias(), unicode.getAlias(), dest, dlen, src, slen, error);
  if (failed(error)) {
    NLS2_TRACE(frame, "Could not convert source to destination %d", error);
    *status = error;
    return frame.result(0);
  }
  return frame.result(distance);
}
