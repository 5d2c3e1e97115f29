// NLS2_MapCodepageIdToName: the one place where a code page number becomes an ICU converter.

#include "nls2.h"
#include "trace/frame.h"

#include <algorithm>
#include <iterator>
#include <unicode/ucnv.h>

namespace {

struct NamedCodepage {
  int32_t codepage;
  const char *converterName;
  const char *detailLine;
  bool twoNullTerminator;
};

#define NAMED(codepage, name, twoNull)                                                             \
  { codepage, name, "Open a converter for codepage " name ".\n", twoNull }

// Numbers that ICU knows only by name, and five Windows numbers that as CCSIDs would give other
// tables. Sorted by number for the search. The set is part of the interface: 57364 is not in it and
// goes to ICU as a CCSID, and of the multi-byte Unicode forms only four count as two-null.
constexpr NamedCodepage namedCodepages[] = {
    NAMED(874, "windows-874", false), NAMED(932, "shift-jis", false),
    NAMED(936, "windows-936", false), NAMED(949, "windows-949", false),
    NAMED(950, "windows-950", false), NAMED(1200, "utf-16be", true),
    NAMED(1208, "utf-8", false),      NAMED(57352, "utf-8", false),
    NAMED(57355, "sbcs", false),      NAMED(57356, "dbcs", false),
    NAMED(57357, "mbcs", false),      NAMED(57358, "utf-16be", true),
    NAMED(57359, "utf-16le", true),   NAMED(57360, "utf-32be", false),
    NAMED(57361, "utf-32le", false),  NAMED(57362, "hz", false),
    NAMED(57363, "scsu", false),      NAMED(57365, "iscii,version=0", false),
    NAMED(57366, "utf-7", false),     NAMED(57367, "bocu1", false),
    NAMED(57368, "utf-16", true),     NAMED(57369, "utf-32", false),
    NAMED(57370, "cesu-8", false),    NAMED(57371, "gb18030", false),
    NAMED(57372, "ucs-2", false),
};

#undef NAMED

static_assert(std::ranges::is_sorted(namedCodepages, {}, &NamedCodepage::codepage));

const NamedCodepage *findNamed(int32_t codepage) {
  const auto *found =
      std::ranges::lower_bound(namedCodepages, codepage, {}, &NamedCodepage::codepage);
  return found != std::end(namedCodepages) && found->codepage == codepage ? found : nullptr;
}

} // namespace

UConverter *NLS2_MapCodepageIdToName(int32_t codepage, int32_t *twoNullTerminator,
                                     int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_MapCodepageIdToName");
  nls2::trace::Frame frame(anchor);
  *status = U_ZERO_ERROR;
  *twoNullTerminator = 0;
  NLS2_TRACE(frame, "Open a converter for codepage number %d.", codepage);

  UErrorCode error = U_ZERO_ERROR;
  UConverter *converter = nullptr;
  if (const NamedCodepage *named = findNamed(codepage)) {
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
