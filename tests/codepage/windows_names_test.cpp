// ccsidMap and NLS2_MapWindowsNameToCCSID.

#include "nls2.h"
#include "support/recording_host.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <iterator>

namespace {

TEST(WindowsNames, TableIsFrozen) {
  const struct {
    const char *name;
    uint32_t ccsid;
  } rows[] = {{"windows-54936", 57371},
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
              {"", 255}};
  ASSERT_EQ(std::size(rows), std::size(ccsidMap));
  for (size_t i = 0; i < std::size(rows); ++i) {
    std::string padded = rows[i].name;
    padded.resize(sizeof ccsidMap[i].name);
    EXPECT_EQ(std::string(std::begin(ccsidMap[i].name), std::end(ccsidMap[i].name)), padded) << i;
    EXPECT_EQ(ccsidMap[i].ccsid, rows[i].ccsid) << i;
  }
}

TEST(WindowsNames, FirstRowThatOccursInTheNameWins) {
  const struct {
    const char *reason;
    const char *name;
    int row; // -1: not found
  } rows[] = {
      {"first row", "windows-54936", 0},
      {"row 8, though 932 stands in it", "windows-51932", 8},
      {"last row", "BIG5", 10},
      {"more behind the name", "windows-9501", 1},
      {"more around the name", "xBIG5-HKSCS", 10},
      {"of two names the one that stands first in the table", "windows-932,windows-936", 2},
      {"US-ASCII", "windows-20127", 9},
      {"UTF-7", "windows-65000", 7},
      {"case counts", "Windows-936", -1},
      {"case counts", "big5", -1},
      {"no row", "windows-1252", -1},
      {"part of a row's name", "windows-95", -1},
      {"empty", "", -1},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(std::string(row.reason) + ": " + row.name);
    const bool found = row.row >= 0;
    const std::string ccsid = found ? std::to_string(ccsidMap[row.row].ccsid) : "0";
    int32_t status = 99;
    const support::Recording recording(support::traceAll);
    EXPECT_EQ(std::to_string(NLS2_MapWindowsNameToCCSID(row.name, &status)), ccsid);
    EXPECT_EQ(status, found ? 0 : 37);
    EXPECT_EQ(
        recording.text({{"NLS2_MapWindowsNameToCCSID", "W"}}),
        "W> entry\nW: Locate matching windows codepage name to " + std::string(row.name) +
            ".\nW: " +
            (found ? "Found matching name " + std::string(ccsidMap[row.row].name) + " in the table."
                   : "No matching name in the table.") +
            "\nW= " + ccsid + "\n");
  }
}

} // namespace
