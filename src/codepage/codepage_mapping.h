// A code page number becomes an ICU converter: what NLS2_MapCodepageIdToName does.
#pragma once

#include "nls2.h"
#include "trace/frame.h"

#include <unicode/ucnv.h>

namespace nls2::codepage {

struct NamedCodepage {
  const char *converterName;
  const char *detailLine;
  bool twoNullTerminator;
};

#define NAMED(codepage, name, twoNull)                                                             \
  case codepage: {                                                                                 \
    static constexpr NamedCodepage row = {name, "Open a converter for codepage " name ".\n",       \
                                          twoNull};                                                \
    return &row;                                                                                   \
  }

// Numbers that ICU knows only by name, and five Windows numbers that as CCSIDs would give other
// tables; null for every other number. The set is part of the interface: 57364 is not in it and
// goes to ICU as a CCSID, and of the multi-byte Unicode forms only four count as two-null. A
// switch, since a search of a table shows in the time of a short translation.
inline const NamedCodepage *namedCodepage(int32_t codepage) {
  // clang-format off
  switch (codepage) {
    NAMED(874, "windows-874", false)
    NAMED(932, "shift-jis", false)
    NAMED(936, "windows-936", false)
    NAMED(949, "windows-949", false)
    NAMED(950, "windows-950", false)
    NAMED(1200, "utf-16be", true)
    NAMED(1208, "utf-8", false)
    NAMED(57352, "utf-8", false)
    NAMED(57355, "sbcs", false)
    NAMED(57356, "dbcs", false)
    NAMED(57357, "mbcs", false)
    NAMED(57358, "utf-16be", true)
    NAMED(57359, "utf-16le", true)
    NAMED(57360, "utf-32be", false)
    NAMED(57361, "utf-32le", false)
    NAMED(57362, "hz", false)
    NAMED(57363, "scsu", false)
    NAMED(57365, "iscii,version=0", false)
    NAMED(57366, "utf-7", false)
    NAMED(57367, "bocu1", false)
    NAMED(57368, "utf-16", true)
    NAMED(57369, "utf-32", false)
    NAMED(57370, "cesu-8", false)
    NAMED(57371, "gb18030", false)
    NAMED(57372, "ucs-2", false)
    default: return nullptr;
  }
  // clang-format on
}

#undef NAMED

// The whole of NLS2_MapCodepageIdToName, its trace frame included, to be compiled into a caller
// that counts nanoseconds: as two calls it was half of what NLS2_TranslateString costs beside ICU.
[[gnu::always_inline]] inline UConverter *
mapCodepageIdToName(int32_t codepage, int32_t *twoNullTerminator, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = trace::anchorOf("NLS2_MapCodepageIdToName");
  trace::Frame frame(anchor);
  *status = U_ZERO_ERROR;
  *twoNullTerminator = 0;
  NLS2_TRACE(frame, "Open a converter for codepage number %d.", codepage);

  UErrorCode error = U_ZERO_ERROR;
  UConverter *converter = nullptr;
  if (const NamedCodepage *named = namedCodepage(codepage)) {
    frame.line(named->detailLine);
    if (named->twoNullTerminator) {
      NLS2_TRACE(frame, "Codepage uses two null character as a string terminator..");
      *twoNullTerminator = 1;
    }
    converter = ucnv_open(named->converterName, &error);
  } else {
    NLS2_TRACE(frame, "Codepage %d not mapped to name. Using codepage as CCSID instead.", codepage);
    converter = ucnv_openCCSID(codepage, UCNV_IBM, &error);
  }
  NLS2_TRACE(frame, "Open converter results %d.", error);
  *status = error;
  return frame.result(converter);
}

} // namespace nls2::codepage
