// What a call that takes an error code reports.
#pragma once

#include "nls2.hpp"

#include <gtest/gtest.h>

// The status that a call leaves in `error`.
#define STATUS_OF(call)                                                                            \
  [&](std::error_code error) {                                                                     \
    call;                                                                                          \
    return error.value();                                                                          \
  }(std::error_code(99, nls2::category()))
