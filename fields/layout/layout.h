// An open layout: the fields of a record.
#pragma once

#include "facts.h"
#include "pages/page.h"

#include <vector>

struct NLS2F_Layout {
  struct Entry {
    NLS2F_Field field; // but for its texts
    std::string name;
    std::string page;
  };

  std::vector<Entry> entries;
  int64_t length = 0;
};

namespace zelfields {

// False with the fault if the text is not a layout. Throws std::bad_alloc.
bool parseLayout(std::string_view text, const NLS2F_Page &page, uint32_t options,
                 NLS2F_Layout &layout, ProblemFacts &fault);

} // namespace zelfields
