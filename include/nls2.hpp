// nls2.hpp - the C++20 interface of libzelnls2, header-only over nls2.h and ICU's C interface.
//
// Conventions. They hold for every function unless its comment says otherwise.
//
//  1. Errors. A function that can fail has two forms, as in std::filesystem: one throws
//  nls2::error,
//     one sets a std::error_code, which is clear on success. ICU's warnings are successes. With
//     -fno-exceptions only the second form is there. It is noexcept unless it returns a string: to
//     make room for that may throw std::bad_alloc.
//  2. On failure a function returns an empty, null or zero value; the comments list the causes as
//     statuses of nls2.h, and the conditions (errc) that stand for them.
//  3. Lengths. Text carries its own. Counts are bytes of char and units of char16_t, exactly. A
//  text
//     that is longer than the C interface can measure is refused (31, errc::too_long).
//  4. Nulls inside a text are text. Where the C function would stop at one, the text is refused
//     (NLS2_ERR_INVALID_PARAMETER).
//  5. Owners (converter, locale, stream, bundle) are move-only and may own nothing. get() lends the
//     handle to C functions, release() hands it over, reset() gives it back.
//  6. Memory. No function allocates more than what it returns, apart from what nls2.h and ICU do.
//  7. Threads, tracing and the rest are as in nls2.h.
//
// Functions of nls2.h without a counterpart here, and what to use:
//
//   NLS2_Init                  nothing depends on it
//   NLS2_initLocaleObject      part of default_locale()
//   NLS2_GetThreadLocale, NLS2_ConvertNativeLocale, NLS2_THREAD_LOCALE
//                              default_locale(): there is no locale of a thread's own
//   NLS2_TranslateString with padding    field_translator
//   NLS2_StringToUnicode, NLS2_UnicodeToString
//                              to_utf8(), from_utf8(): the two lose text that grows
//   NLS2_Strlen                to_utf16().size(): it ends at a zero byte, whatever the code page
//   NLS2_ByteLength            ICU's U8_LENGTH: it looks at the first byte only
//   NLS2_MapString             ICU's u_strToUpper and its like: it maps no text
//   NLS2_StringToDouble        always 0
//   CHARBASED                  lengths are known here; its own wrap at 16 bits
#ifndef NLS2_HPP
#define NLS2_HPP

#include "nls2/bundle.hpp"
#include "nls2/code_page.hpp"
#include "nls2/error.hpp"
#include "nls2/field_translator.hpp"
#include "nls2/language.hpp"
#include "nls2/locale.hpp"
#include "nls2/signature.hpp"
#include "nls2/stream.hpp"
#include "nls2/text.hpp"

#include <string_view>

namespace nls2 {

// How the library was built (NLS2_BuildStamp): one static line.
inline std::string_view build_stamp() noexcept { return NLS2_BuildStamp(); }

} // namespace nls2

#endif
