// The order of strings by the rules of a language, as the library's comparison has it.

#include "text/string_order.h"

#include "errors.h"
#include "nls2.h"

#include <fmt/core.h>
#include <unicode/utypes.h>

namespace nls2::tool {

// Under SORT_IGNORETRAILING the library looks for blanks before the first null, not at the end.
StringOrder::StringOrder(const LocaleOptions &locale, bool ignoreTrailing)
    : locale_(locale), options_(ignoreTrailing ? uint32_t{SORT_IGNORETRAILING} : 0),
      check_(locale.codepage, mostBytes, ignoreTrailing ? Nulls::endText : Nulls::areText) {}

int32_t StringOrder::compare(std::string_view a, std::string_view b) const {
  int32_t status = U_ZERO_ERROR;
  const int32_t order = NLS2_Strcoll(locale_.get(), a.data(), static_cast<int16_t>(a.size()),
                                     b.data(), static_cast<int16_t>(b.size()), options_, &status);
  if (status > U_ZERO_ERROR) {
    throw failure("cannot compare: {}", statusText(status));
  }
  return order;
}

} // namespace nls2::tool
