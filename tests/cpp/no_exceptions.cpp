// Compiled with -fno-exceptions: the forms that take an error code are there, and only they.

#include "nls2.hpp"

template <class Page>
constexpr bool throws = requires(Page page) {
  nls2::open_converter(page);
};
template <class Page>
constexpr bool reports = requires(Page page, std::error_code &e) {
  nls2::open_converter(page, e);
};
static_assert(!throws<nls2::code_page> && reports<nls2::code_page>);
