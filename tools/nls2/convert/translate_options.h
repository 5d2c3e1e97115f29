// The options of `nls2 translate`.
#pragma once

#include "nls2/translator.hpp"

#include <cstdint>
#include <limits>
#include <optional>
#include <string>
#include <vector>

namespace nls2::tool {

enum class OnError { stop, replace, reject };
enum class Newline { none, lf, crlf, nel };

// The bytes of a record that become a field of the output.
struct FieldSpec {
  enum class Kind { text, raw, hex };

  std::size_t begin = 0; // the first byte in the record, from 0
  std::size_t end = 0;   // after the last one
  Kind kind = Kind::text;
  int32_t from = 0;      // the code page of a text
  std::size_t width = 0; // bytes in the output; 0: as it comes

  std::size_t length() const { return end - begin; }
};

struct TranslateOptions {
  int32_t from = 0;
  int32_t to = 0;
  std::size_t recordLength = 0; // 0: lines
  std::size_t outLength = 0;    // 0: as much as it takes
  nls2::padding padding = nls2::padding::as_is;
  std::vector<FieldSpec> fields; // none: the whole record
  std::optional<Newline> newline;
  bool csv = false;
  OnError onError = OnError::stop;
  bool verify = false;
  bool dryRun = false;
  bool sync = false;
  std::optional<bool> progress; // by default if standard error is a terminal
  uint64_t skip = 0;
  uint64_t count = std::numeric_limits<uint64_t>::max();
  std::string input = "-";
  std::string output = "-";
  std::optional<std::string> rejects;
  std::optional<std::string> report;

  const char *unit() const { return recordLength == 0 ? "line" : "record"; }
};

// Parses START-END[=KIND][:WIDTH],... Throws usageError, which quotes the wrong piece.
std::vector<FieldSpec> parseFields(std::string_view list, const TranslateOptions &options);

// The exit code. Throws Error.
int translateFile(const TranslateOptions &options);

} // namespace nls2::tool
