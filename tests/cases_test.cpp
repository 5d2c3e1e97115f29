// The case files of all rooms.

#include "support/call_cases.h"

#include <filesystem>
#include <gtest/gtest.h>
#include <unicode/ustdio.h>

namespace {

class Cases : public testing::TestWithParam<std::string> {};

TEST_P(Cases, AnswerAsTheFileHasThem) {
  std::filesystem::current_path(std::filesystem::path(MESSAGES_DIR).parent_path());
  UFILE *const first = u_fopen("/dev/null", "r", nullptr, nullptr); // as firstObject in words.cpp
  support::expectCases(CASES_FOLDER "/" + GetParam() + "/" + GetParam() + ".cases");
  u_fclose(first);
}

INSTANTIATE_TEST_SUITE_P(Of, Cases, testing::Values("codepage", "convert", "io", "locale", "text"),
                         [](const auto &room) { return room.param; });

} // namespace
