// Fields of comma-separated values, as RFC 4180 quotes them.
#pragma once

#include "convert/byte_buffer.h"

namespace nls2::tool {

// Quotes the last `length` bytes of the output, a field in UTF-8, where that is needed.
void quoteForCsv(ByteBuffer &out, std::size_t length);

} // namespace nls2::tool
