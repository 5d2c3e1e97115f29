// What a call that takes an error code reports, and the process's default locale for it.
#pragma once

#include "nls2.hpp"

#include <gtest/gtest.h>
#include <unicode/uloc.h>

// The status that a call leaves in `error`.
#define STATUS_OF(call)                                                                            \
  [&](std::error_code error) {                                                                     \
    call;                                                                                          \
    return error.value();                                                                          \
  }(std::error_code(99, nls2::category()))

class WithDefaultLocale : public testing::Test {
protected:
  WithDefaultLocale() {
    UErrorCode failure = U_ZERO_ERROR;
    uloc_setDefault("en_US", &failure);
  }
};
