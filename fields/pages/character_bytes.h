// The bytes of single characters in a page.
#pragma once

#include "pages/page.h"

#include <string>

namespace zelfields {

// Of a character of the BMP after another, so without a signature and shifts that the first one
// brings; empty if the page does not have it. Throws std::bad_alloc.
std::string bytesOf(const NLS2F_Page &page, char16_t character);

} // namespace zelfields
