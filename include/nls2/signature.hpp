// signature.hpp - Unicode signatures (byte-order marks) of texts.
#ifndef NLS2_SIGNATURE_HPP
#define NLS2_SIGNATURE_HPP

#include "nls2/detail/common.hpp"

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace nls2 {

// The Unicode encoding whose signature (byte-order mark) a text begins with: ICU's name of it,
// static text, and the length of the signature in bytes. Empty and 0 where there is none.
//
// Surprise: FF FE 00 00 is UTF-32LE, even where it begins a text in UTF-16LE.
struct unicode_signature {
  std::string_view encoding;
  std::size_t length;
};

// Five bytes of the text are enough.
inline unicode_signature detect_unicode_signature(std::string_view text) noexcept {
  std::int32_t length = 0;
  std::int32_t status = 0;
  const char *name = NLS2_detectUnicodeSignature(detail::data_of(text),
                                                 detail::to_int32(text.size()), &length, &status);
  return name == nullptr ? unicode_signature{}
                         : unicode_signature{name, static_cast<std::size_t>(length)};
}

} // namespace nls2

#endif
