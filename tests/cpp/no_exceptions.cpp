// Compiled with -fno-exceptions: an error code must be passed.

#include "nls2.hpp"
#include "nls2/bundle.hpp"
#include "nls2/stream.hpp"

using Code = std::error_code &;
static_assert(!std::is_constructible_v<nls2::code_page, const char *>);
static_assert(std::is_constructible_v<nls2::code_page, const char *, Code>);
static_assert(!std::is_copy_constructible_v<nls2::translator>);
static_assert(std::is_constructible_v<nls2::translator, const nls2::translator &, Code>);
