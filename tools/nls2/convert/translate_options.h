// What `nls2 translate` is asked to do.
#pragma once

#include "convert/field_list.h"
#include "nls2/field_types.hpp"

#include <cstdint>
#include <limits>
#include <optional>
#include <string>
#include <vector>

namespace nls2::tool {

enum class OnError { stop, replace, reject };
enum class Newline { none, lf, crlf, nel };

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
  std::optional<bool> progress; // nothing: where standard error is a terminal
  uint64_t skip = 0;
  uint64_t count = std::numeric_limits<uint64_t>::max();
  std::string input = "-";
  std::string output = "-";
  std::string rejects; // empty: none
  std::string report;  // empty: none
};

} // namespace nls2::tool
