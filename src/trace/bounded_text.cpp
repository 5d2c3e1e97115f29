// A text for a detail line, copied only if no null ends it.

#include "trace/bounded_text.h"

#include "trace/frame.h"

#include <cstddef>
#include <cstdlib>
#include <cstring>

namespace nls2::trace {

BoundedText::BoundedText(const char *bytes, int64_t byteLength) : text_(text(bytes)) {
  if (bytes == nullptr || byteLength < 0) {
    return;
  }
  auto length = static_cast<std::size_t>(byteLength);
  if (std::memchr(bytes, 0, length) != nullptr) {
    return;
  }
  // Not from realloc_mem: printing a line must not produce further lines.
  char *copy = small_;
  if (length >= sizeof small_) {
    copy_.reset(static_cast<char *>(std::malloc(length + 1)));
    if (copy_ != nullptr) {
      copy = copy_.get();
    } else {
      length = sizeof small_ - 1;
    }
  }
  std::memcpy(copy, bytes, length);
  copy[length] = '\0';
  text_ = copy;
}

} // namespace nls2::trace
