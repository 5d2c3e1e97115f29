// The options of `nls2 translate`.
#pragma once

#include "codepage/code_page.h"

#include <cstdint>
#include <limits>
#include <optional>
#include <string>

namespace nls2::tool {

enum class OnError { stop, replace, reject };

struct TranslateOptions {
  std::optional<CodePage> from;
  std::optional<CodePage> to;
  std::string read; // formats, as nls2_fields.h has them
  std::string write;
  std::optional<std::string> layout; // the file
  std::optional<std::string> fields; // the list
  bool keepsBlanks = false;
  OnError onError = OnError::stop;
  bool verify = false;
  bool dryRun = false;
  bool sync = false;
  bool progress = false; // also if standard error is no terminal
  uint64_t skip = 0;
  uint64_t count = std::numeric_limits<uint64_t>::max();
  std::string input = "-";
  std::string output = "-";
  std::optional<std::string> rejects;
  std::optional<std::string> report;
  std::optional<std::string> problems;
  uint64_t problemsLimit = 10000; // lines
};

// The exit code. Throws Error.
int translateFile(const TranslateOptions &options);

} // namespace nls2::tool
