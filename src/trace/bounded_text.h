// A text for a detail line that ends at its length, not only at a null.
#pragma once

#include "trace/memory.h"

#include <cstdint>

#include <unicode/utypes.h>

namespace nls2::trace {

// What `%s` may read of a text that comes with a length: the bytes up to that length or to the
// first zero byte, whichever comes first. A negative length means a null-terminated text; a
// null pointer prints as "(null)". UTF-16 text prints as the bytes it consists of.
//
// Construct it inside the NLS2_TRACE that prints it: it then lives until the host returns, and is
// not constructed while detail tracing is off:   NLS2_TRACE(frame, "source %s", BoundedText(source,
// length).c_str());
class BoundedText {
public:
  BoundedText(const char *bytes, int32_t byteLength) : BoundedText(bytes, int64_t{byteLength}) {}
  BoundedText(const UChar *units, int32_t unitLength)
      : BoundedText(reinterpret_cast<const char *>(units),
                    static_cast<int64_t>(unitLength) * static_cast<int64_t>(sizeof(UChar))) {}
  BoundedText(const BoundedText &) = delete;
  BoundedText &operator=(const BoundedText &) = delete;

  const char *c_str() const { return text_; }

private:
  BoundedText(const char *bytes, int64_t byteLength);

  const char *text_;
  Block<char> copy_;
  char small_[64]; // short copies, and the beginning of a long one that the heap has no room for
};

} // namespace nls2::trace
