// The list of --fields: which bytes of a record become which fields of the output.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace nls2::tool {

struct FieldSpec {
  enum class Kind { text, raw, hex };

  std::size_t begin = 0; // the first byte in the record, from 0
  std::size_t end = 0;   // after the last one
  Kind kind = Kind::text;
  int32_t from = 0;      // the code page of a text
  std::size_t width = 0; // bytes in the output; 0: as it comes

  std::size_t length() const { return end - begin; }
};

// START-END[=KIND][:WIDTH],... for records of `recordLength` bytes; `from` is the code page of a
// plain text. Throws usageError, which quotes the piece that is wrong; `csv` allows less.
std::vector<FieldSpec> parseFields(const std::string &list, std::size_t recordLength, int32_t from,
                                   bool csv);

} // namespace nls2::tool
