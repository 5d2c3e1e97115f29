// An open layout: the fields of a record.
#pragma once

#include "nls2_fields.h"

#include <string>
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
