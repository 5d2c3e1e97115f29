// ccsidMap and NLS2_MapWindowsNameToCCSID.

#include "nls2.h"
#include "support/known_call.h"

#include <gtest/gtest.h>

namespace {

TEST(WindowsNames, TableIsFrozen) {
  const support::Recording recording(support::traceOff);
  for (const auto &row : ccsidMap) {
    std::string name(row.name, sizeof row.name);
    name.erase(name.find_last_not_of('\0') + 1); // zero bytes up to its end
    support::mark(name + " " + std::to_string(row.ccsid));
  }
  support::expectKnownTrace("ccsidMap", recording);
}

TEST(WindowsNames, FirstRowThatOccursInTheNameWins) {
  const struct {
    const char *reason, *name;
  } rows[] = {
      {"first row", "windows-54936"},
      {"row 8, though 932 stands in it", "windows-51932"},
      {"last row", "BIG5"},
      {"more behind the name", "windows-9501"},
      {"more around the name", "xBIG5-HKSCS"},
      {"of two names the one that stands first in the table", "windows-932,windows-936"},
      {"case counts", "big5"},
      {"no row", "windows-1252"},
      {"part of a row's name", "windows-95"},
      {"empty", ""},
  };
  for (const auto &row : rows) {
    support::expectKnownCall(
        std::string("Windows name, ") + row.reason, "", {}, [&](int32_t *status) {
          return static_cast<int32_t>(NLS2_MapWindowsNameToCCSID(row.name, status));
        });
  }
}

} // namespace
