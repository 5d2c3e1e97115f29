// nls2.hpp - the C++20 interface of libzelnls2, header-only over nls2.h and ICU's C interface.
#ifndef NLS2_HPP
#define NLS2_HPP

#include "nls2/code_page.hpp"
#include "nls2/error.hpp"
#include "nls2/field_translator.hpp"

#endif
