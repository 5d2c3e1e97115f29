// Fields of comma-separated values, as RFC 4180 quotes them.

#include "convert/csv.h"

#include <string>
#include <string_view>

namespace nls2::tool {

void quoteForCsv(ByteBuffer &out, std::size_t length) {
  const std::string_view field = out.bytes().substr(out.size() - length);
  if (field.find_first_of(",\"\r\n") == std::string_view::npos) {
    return;
  }
  std::string quoted = "\"";
  for (const char byte : field) {
    quoted.append(byte == '"' ? 2 : 1, byte);
  }
  quoted += '"';
  out.truncate(out.size() - length);
  out.append(quoted);
}

} // namespace nls2::tool
