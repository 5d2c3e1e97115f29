// An open translator.
#pragma once

#include "pages/page.h"
#include "translate/path.h"

struct NLS2F_Translator {
  NLS2F_Translator(UConverter *from, UConverter *to, const NLS2F_Policy &policy, UErrorCode &error)
      : path(from, to, policy, error) {}

  bool translate(std::string_view field, zelfields::Room room, zelfields::Done &done,
                 NLS2F_Problem &problem) {
    return path.translate(field, room, done, problem);
  }

  zelfields::Path path;
};
