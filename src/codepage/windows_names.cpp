// ccsidMap and NLS2_MapWindowsNameToCCSID: Windows code-page names.

#include "nls2.h"
#include "trace/frame.h"

#include <cstddef>
#include <cstring>

static_assert(sizeof(CcsidMapEntry) == 136);
static_assert(offsetof(CcsidMapEntry, ccsid) == 132);

// A search takes the first record whose name occurs in the text looked up, so a name must come
// before any shorter name that it contains.
constexpr CcsidMapEntry ccsidMap[NLS2_CCSID_MAP_RECORDS] = {
    {"windows-54936", 57371},
    {"windows-950", 950},
    {"windows-936", 936},
    {"windows-949", 949},
    {"windows-874", 874},
    {"windows-1256", 1256},
    {"windows-932", 932},
    {"windows-65000", 57366},
    {"windows-51932", 5050},
    {"windows-20127", 367},
    {"BIG5", 950},
    {"", 255},
};

uint32_t NLS2_MapWindowsNameToCCSID(const char *name, int32_t *status) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_MapWindowsNameToCCSID");
  nls2::trace::Frame frame(anchor);
  *status = U_ZERO_ERROR;
  NLS2_TRACE(frame, "Locate matching windows codepage name to %s.", name);
  for (const CcsidMapEntry *entry = ccsidMap; entry->ccsid != NLS2_CCSID_MAP_END; ++entry) {
    if (std::strstr(name, entry->name) != nullptr) {
      NLS2_TRACE(frame, "Found matching name %s in the table.", entry->name);
      *status = U_ZERO_ERROR;
      return frame.result(entry->ccsid);
    }
  }
  NLS2_TRACE(frame, "No matching name in the table.");
  *status = NLS2_ERR_INVALID_PARAMETER;
  return frame.result(0U);
}
