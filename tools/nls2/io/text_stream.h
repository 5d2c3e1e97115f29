// A text file in any encoding, read through the library's streams.
#pragma once

#include "nls2.h"

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace nls2::tool {

class TextStream {
public:
  // "-" is standard input. Throws Error for an encoding that ICU does not have, Failure for a
  // file that does not open.
  TextStream(const std::string &path, const std::string &encoding);

  // The next part of the text as UTF-8; empty at the end. Throws Error.
  std::string read();

  // Byte sequences so far that are no text of the encoding; each was read as a substitute.
  uint64_t badSequences() const { return *badSequences_; }

private:
  struct Release {
    void operator()(NLS2_Locale *locale) const { NLS2_ReleaseLocale(locale); }
  };
  struct Close {
    const NLS2_Locale *locale;
    void operator()(UFILE *stream) const { NLS2_CloseStream(locale, stream); }
  };

  void open(const std::string &encoding);
  std::size_t fill(); // the units that came behind those kept
  [[noreturn]] void fail() const;

  std::string path_;
  std::unique_ptr<uint64_t> badSequences_ = std::make_unique<uint64_t>(0);
  std::unique_ptr<NLS2_Locale, Release> locale_;
  std::unique_ptr<UFILE, Close> stream_{nullptr, Close{nullptr}};
  std::vector<UChar> units_;
  std::size_t kept_ = 0; // units at the beginning that wait for what follows them
};

} // namespace nls2::tool
