// Statuses of the library in words: ICU's names, and the library's own.

#include "status.h"

#include "nls2.h"

#include <fmt/core.h>
#include <unicode/utypes.h>

namespace nls2::tool {

namespace {

const char *nameOf(int32_t status) {
  switch (status) {
  case NLS2_ERR_NO_MEMORY:
    return "NLS2_ERR_NO_MEMORY";
  case NLS2_ERR_INVALID_OPTION:
    return "NLS2_ERR_INVALID_OPTION";
  case NLS2_ERR_INVALID_PARAMETER:
    return "NLS2_ERR_INVALID_PARAMETER";
  case NLS2_ERR_INVALID_LOCALE:
    return "NLS2_ERR_INVALID_LOCALE";
  case NLS2_ERR_LANGUAGE_NOT_FOUND:
    return "NLS2_ERR_LANGUAGE_NOT_FOUND";
  default:
    return u_errorName(static_cast<UErrorCode>(status));
  }
}

} // namespace

std::string statusName(int32_t status) { return fmt::format("{} ({})", nameOf(status), status); }

std::string statusAdvice(int32_t status) {
  switch (status) {
  case U_FILE_ACCESS_ERROR:
    return "this ICU has no converter for the code page; `nls2 codepages` lists numbers";
  case U_BUFFER_OVERFLOW_ERROR:
    return "give a larger --out-length";
  case U_INVALID_CHAR_FOUND:
  case U_TRUNCATED_CHAR_FOUND:
  case U_ILLEGAL_CHAR_FOUND:
  case U_ILLEGAL_ESCAPE_SEQUENCE:
  case U_UNSUPPORTED_ESCAPE_SEQUENCE:
    return "the bytes are not text of the code page given with --from";
  case U_MEMORY_ALLOCATION_ERROR:
  case NLS2_ERR_NO_MEMORY:
    return "out of memory; is the record length right?";
  default:
    return "";
  }
}

} // namespace nls2::tool
