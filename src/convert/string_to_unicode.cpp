// A locale's code page and UTF-8 between two open converters: NLS2_StringToUnicode,
// NLS2_UnicodeToString.

#include "codepage/locale_converter.h"
#include "locale/registry.h"
#include "nls2.h"
#include "trace/bounded_text.h"
#include "trace/frame.h"
#include "trace/memory.h"
#include "trace/status.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using icu::LocalUConverterPointer;
using nls2::failed;
using nls2::trace::BoundedText;
using nls2::trace::Frame;
using nls2::trace::low32;

constexpr const char *utf8 = "utf-8";

std::uintptr_t addressOf(const void *pointer) { return reinterpret_cast<std::uintptr_t>(pointer); }

// A length may reach outside its buffer, so no pointer arithmetic: ICU compares the addresses and
// rejects bad ranges.
template <class Pointer>
Pointer limitOf(Pointer start, int32_t length) {
  return reinterpret_cast<Pointer>(addressOf(start) + static_cast<std::uintptr_t>(length));
}

// How long a range is; negative if ICU rejects it.
int64_t rangeLength(const char *start, const char *limit) {
  const bool refused = start == nullptr || addressOf(limit) < addressOf(start) ||
                       addressOf(limit) - addressOf(start) > INT32_MAX;
  return refused ? -1 : static_cast<int64_t>(addressOf(limit) - addressOf(start));
}

// Converts from the source to the source: the output starts where the input does and may go on to
// dest + dlen. The result is how far the output's end is from the input's.
//
// UTF-8 to UTF-8 is converted in a copy, and the output is copied back: in place, ICU would write
// up to 4 bytes past the limit, when invalid bytes grow to U+FFFD and the output overtakes the
// input. Without memory for a copy it is converted in place all the same.
int32_t convertInPlace(UConverter *to, UConverter *from, char *dest, int32_t dlen, const char *src,
                       int32_t slen, UErrorCode &error) {
  constexpr int64_t overrun = 16;
  char *const begin = const_cast<char *>(src);
  char *output = begin;
  char *outputLimit = limitOf(dest, dlen);
  const char *input = src;
  const char *inputLimit = limitOf(src, slen);
  int64_t room = rangeLength(begin, outputLimit);
  // Each byte becomes at least one byte of output, so ICU does not get further than the room.
  const int64_t size = std::min(rangeLength(src, inputLimit), room + overrun);
  nls2::trace::Block<char> copy;
  if (room >= 0 && size >= 0 && ucnv_getType(to) == UCNV_UTF8 && ucnv_getType(from) == UCNV_UTF8) {
    room = std::min(room, 3 * size + 1); // enough for U+FFFD a byte
    copy.reset(
        static_cast<char *>(std::malloc(static_cast<std::size_t>(std::max(room, size) + overrun))));
  }
  if (copy) {
    std::memcpy(copy.get(), src, static_cast<std::size_t>(size));
    output = copy.get();
    outputLimit = output + room;
    input = output;
    inputLimit = output + size;
  }
  ucnv_convertEx(to, from, &output, outputLimit, &input, inputLimit, nullptr, nullptr, nullptr,
                 nullptr, true, true, &error);
  if (copy) {
    // ICU puts a null after the output.
    const int64_t written = output - copy.get() + (failed(error) ? 0 : 1);
    std::memcpy(begin, copy.get(), static_cast<std::size_t>(std::min(written, room)));
  }
  return static_cast<int32_t>(addressOf(output) - addressOf(input));
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
