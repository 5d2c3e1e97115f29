// An open translator.
#pragma once

#include "pages/page.h"
#include "translate/chunks.h"
#include "translate/path.h"
#include "translate/table.h"

#include <memory>

struct NLS2F_Translator {
  // `isBare`: neither page has a signature.
  NLS2F_Translator(UConverter *from, UConverter *to, const NLS2F_Policy &policy, bool isBare,
                   UErrorCode &error)
      : path(from, to, policy, error), table(path, isBare) {}
  NLS2F_Translator(UConverter *from, UConverter *to, const NLS2F_Translator &other,
                   UErrorCode &error)
      : path(from, to, other.path.policy(), error), table(path, other.table) {}

  // A whole field, which ends a text that goes piece by piece. False if there is a problem.
  bool translate(std::string_view field, zelfields::Room room, zelfields::Done &done,
                 NLS2F_Problem *problem) {
    return table.translate(field, room, done) || goPath(field, room, done, problem);
  }
  void abandonPieces() {
    if (pieces) {
      pieces->abandon();
    }
  }
  zelfields::Chunks &chunks() {
    if (!pieces) {
      pieces = std::make_unique<zelfields::Chunks>(path);
    }
    return *pieces;
  }

  [[gnu::noinline]] bool goPath(std::string_view field, zelfields::Room room, zelfields::Done &done,
                                NLS2F_Problem *problem);

  zelfields::Path path;
  zelfields::Table table;
  std::unique_ptr<zelfields::Chunks> pieces; // from the first one on
};
