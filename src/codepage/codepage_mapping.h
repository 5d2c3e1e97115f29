// A code page number becomes an ICU converter: what NLS2_MapCodepageIdToName does.
#pragma once

#include "nls2.h"
#include "trace/frame.h"

#include <unicode/ucnv.h>

namespace nls2::codepage {

struct NamedCodepage {
  const char *converterName; // null: none
  bool twoNullTerminator;
};

// The numbers that have a name: those that ICU knows only by name, and five Windows numbers, which
// as CCSIDs would open other tables. The set is part of the interface: 57364 is not in it and goes
// to ICU as a CCSID, and only four of the multi-byte Unicode forms count as two-null. A switch,
// because searching a table would slow short translations down measurably.
constexpr NamedCodepage namedCodepage(int32_t codepage) {
  // clang-format off
  switch (codepage) {
  case 874: return {"windows-874", false};
  case 932: return {"shift-jis", false};
  case 936: return {"windows-936", false};
  case 949: return {"windows-949", false};
  case 950: return {"windows-950", false};
  case 1200: return {"utf-16be", true};
  case 1208: case 57352: return {"utf-8", false};
  case 57355: return {"sbcs", false};
  case 57356: return {"dbcs", false};
  case 57357: return {"mbcs", false};
  case 57358: return {"utf-16be", true};
  case 57359: return {"utf-16le", true};
  case 57360: return {"utf-32be", false};
  case 57361: return {"utf-32le", false};
  case 57362: return {"hz", false};
  case 57363: return {"scsu", false};
  case 57365: return {"iscii,version=0", false};
  case 57366: return {"utf-7", false};
  case 57367: return {"bocu1", false};
  case 57368: return {"utf-16", true};
  case 57369: return {"utf-32", false};
  case 57370: return {"cesu-8", false};
  case 57371: return {"gb18030", false};
  case 57372: return {"ucs-2", false};
  default: return {nullptr, false};
  }
  // clang-format on
}

// All of NLS2_MapCodepageIdToName, with its trace frame, compiled into hot callers: as separate
// calls it was half of what NLS2_TranslateString costs on top of ICU.
[[gnu::always_inline]] inline UConverter *
mapCodepageIdToName(int32_t codepage, int32_t *twoNullTerminator, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = trace::anchorOf("NLS2_MapCodepageIdToName");
  trace::Frame frame(anchor);
  *status = U_ZERO_ERROR;
  *twoNullTerminator = 0;
  NLS2_TRACE(frame, "Open a converter for codepage number %d.", codepage);

  UErrorCode error = U_ZERO_ERROR;
  UConverter *converter = nullptr;
  if (const auto [name, twoNull] = namedCodepage(codepage); name != nullptr) {
    NLS2_TRACE(frame, "Open a converter for codepage %s.", name);
    if (twoNull) {
      NLS2_TRACE(frame, "Codepage uses two null character as a string terminator..");
      *twoNullTerminator = 1;
    }
    converter = ucnv_open(name, &error);
  } else {
    NLS2_TRACE(frame, "Codepage %d not mapped to name. Using codepage as CCSID instead.", codepage);
    converter = ucnv_openCCSID(codepage, UCNV_IBM, &error);
  }
  NLS2_TRACE(frame, "Open converter results %d.", error);
  *status = error;
  return frame.result(converter);
}

} // namespace nls2::codepage
