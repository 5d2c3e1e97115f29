// The order of texts by the rules of a language, as sort keys.
#pragma once

#include "locale/locale_option.h"
#include "text/decoder.h"

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unicode/localpointer.h>
#include <unicode/ucol.h>

namespace nls2::tool {

// Gives every text a key; the keys' bytes compare as the library's comparison orders the texts. For
// one thread at a time.
class LineOrder {
public:
  // Throws usageError.
  LineOrder(const LocaleOptions &locale, bool ignoreTrailing);

  // Makes the key of a text; why there is none where its bytes are at fault.
  std::optional<TextFault> makeKey(std::string_view bytes);
  // The last key, valid until the next call.
  std::string_view key() const { return {key_.data(), length_}; }

private:
  Decoder decoder_;
  const bool ignoreTrailing_;
  icu::LocalUCollatorPointer collator_;
  std::string key_;
  std::size_t length_ = 0;
};

} // namespace nls2::tool
