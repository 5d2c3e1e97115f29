// nls2.hpp - the C++20 interface, header-only over nls2.h and nls2_fields.h.
//
// Conventions. They hold for every function unless its comment says otherwise.
//
//  1. Errors. A function that can fail takes a std::error_code& last, which is clear on success. If
//     it is left out, a failure throws nls2::error. With -fno-exceptions it cannot be left out.
//     ICU's warnings are successes.
//  2. On failure a function returns an empty, null or zero value. Each comment lists its statuses,
//     with their errc in parentheses. translate() of a translator returns a result instead.
//  3. Bytes to read are a byte_view, room for output a byte_room: any contiguous range of char,
//     unsigned char, std::byte or char8_t. A std::string as output is appended to.
//  4. Counts are bytes, or units of char16_t, exactly. A null character is an ordinary character.
//  5. Pages come in the order (from, to).
//  6. Owners (code_page, translator, collator, locale, bundle) are empty after a default
//     constructor, a move or a failure. get() returns the handle, release() gives up ownership,
//     reset() closes it.
//  7. Nothing is lost silently: where text converts there is a strict form and one that counts what
//     was replaced.
//  8. Memory. Functions that return or extend a string may throw std::bad_alloc.
//  9. Threads. A code_page can be used by any number of threads at once, every other object by one
//     thread at a time.
//
// Not included here, because they need ICU's headers or handles:
//
//   nls2/stream.hpp            files of text in any encoding
//   nls2/bundle.hpp            resource bundles
//
// Functions of nls2.h without a counterpart here, and what to use:
//
//   NLS2_Init                  nothing depends on it
//   NLS2_initLocaleObject      part of locale::of_process()
//   NLS2_GetThreadLocale, NLS2_ConvertNativeLocale, NLS2_SetLocaleFromNative
//                              locale::of_process(): threads have no locales of their own
//   NLS2_MapCodepageIdToName, NLS2_GetCodepageName, NLS2_GetCodepageId, NLS2_MapWindowsNameToCCSID
//                              code_page and its facts()
//   NLS2_TranslateString, NLS2_toUTF8 and its like, NLS2_StringToUnicode, NLS2_UnicodeToString
//                              translator; translate(), to_utf16(), from_utf16()
//   NLS2_ConversionRatio       translator::max_size()
//   NLS2_Strlen                to_utf16().size(): it ends at a zero byte, whatever the code page
//   NLS2_ByteLength            ICU's U8_COUNT_TRAIL_BYTES(lead) + 1
//   NLS2_Strcoll, NLS2_Findstr collator
//   NLS2_MapString             ICU's u_strToUpper and its like: it maps no text
//   NLS2_StringToDouble        always 0
#ifndef NLS2_HPP
#define NLS2_HPP

#include "nls2/bytes.hpp"
#include "nls2/code_page.hpp"
#include "nls2/collator.hpp"
#include "nls2/error.hpp"
#include "nls2/language.hpp"
#include "nls2/locale.hpp"
#include "nls2/text.hpp"
#include "nls2/translator.hpp"

#include <string_view>

namespace nls2 {
inline namespace NLS2_MODE {

// How the library was built (NLS2_BuildStamp): one static line.
[[nodiscard]] inline std::string_view build_stamp() noexcept { return NLS2_BuildStamp(); }

} // namespace NLS2_MODE
} // namespace nls2

#endif
