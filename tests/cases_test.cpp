// The case files of all rooms.

#include "support/call_cases.h"

#include <filesystem>
#include <gtest/gtest.h>

namespace {

class Cases : public testing::TestWithParam<std::string> {};

TEST_P(Cases, AnswerAsTheFileHasThem) {
  std::filesystem::current_path(std::filesystem::path(MESSAGES_DIR).parent_path());
  support::expectCases(CASES_FOLDER "/" + GetParam() + "/" + GetParam() + ".cases");
}

INSTANTIATE_TEST_SUITE_P(Of, Cases, testing::Values("codepage", "convert", "io", "locale", "text"),
                         [](const auto &room) { return room.param; });

} // namespace
