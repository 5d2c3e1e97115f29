// Statuses as error codes: their messages and the conditions that they stand for.

#include "nls2.hpp"

#include <gtest/gtest.h>
#include <map>

namespace {

using nls2::errc;

TEST(Errors, MessagesAreWordsAndTheNameOfTheStatus) {
  const std::map<int, std::string> known = {
      {-128, "a warning of ICU (U_USING_FALLBACK_WARNING)"},
      {1, "an argument is not valid (U_ILLEGAL_ARGUMENT_ERROR)"},
      {2, "the resource is missing (U_MISSING_RESOURCE_ERROR)"},
      {4, "ICU has no such converter or data file (U_FILE_ACCESS_ERROR)"},
      {10, "a character has no counterpart in the code page (U_INVALID_CHAR_FOUND)"},
      {15, "the destination is too small (U_BUFFER_OVERFLOW_ERROR)"},
      {31, "the input is too long (U_INPUT_TOO_LONG_ERROR)"},
      {32, "out of memory (NLS2_ERR_NO_MEMORY)"},
      {33, "unknown status (33)"},
      {37, "an argument is not valid, or a name is unknown (NLS2_ERR_INVALID_PARAMETER)"},
      {38, "no live locale object (NLS2_ERR_INVALID_LOCALE)"},
      {39, "the language id is unknown (NLS2_ERR_LANGUAGE_NOT_FOUND)"},
      {0x10300, "an error of ICU (U_REGEX_INTERNAL_ERROR)"},
  };
  for (int status = -128; status <= 0x10300; ++status) {
    const std::string message = nls2::category().message(status);
    const std::string name = u_errorName(static_cast<UErrorCode>(status));
    EXPECT_TRUE(message.ends_with(std::string(" (").append(name) + ")") || name.starts_with('['))
        << message;
    EXPECT_TRUE(!known.contains(status) || message == known.at(status)) << message;
    EXPECT_EQ(message.starts_with("an error"), status > 40 && !name.starts_with('[')) << message;
  }
}

TEST(Errors, ConditionsGatherTheStatusesThatSayTheSame) {
  const std::tuple<errc, std::errc, std::vector<int>> rows[] = {
      {errc::no_memory, std::errc::not_enough_memory, {7, 32}},
      {errc::invalid_argument, std::errc::invalid_argument, {1, 8, 36, 37}},
      {errc::no_room, std::errc::no_buffer_space, {15}},
      {errc::too_long, std::errc::value_too_large, {31}},
      {errc::invalid_text, std::errc::illegal_byte_sequence, {10, 11, 12, 18, 19}},
      {errc::invalid_locale, {}, {38}},
      {errc::language_not_found, {}, {39}},
      {errc::unknown_code_page, {}, {4}},
      {errc::not_found, {}, {2}},
      {errc::wrong_type, {}, {17}}};
  for (const auto &[condition, standard, statuses] : rows) {
    for (int status = -1; status < 41; ++status) {
      const std::error_code code = nls2::make_status(status);
      const bool same = std::find(statuses.begin(), statuses.end(), status) != statuses.end();
      EXPECT_EQ(code == condition, same) << status;
      EXPECT_EQ(code == standard, same && standard != std::errc()) << status;
    }
  }
  EXPECT_NE(std::error_code(32, std::generic_category()), errc::no_memory);
  EXPECT_EQ(make_error_condition(errc::no_room).message(), "the destination is too small");
  EXPECT_STREQ(nls2::error(32, "what").what(), "what: out of memory (NLS2_ERR_NO_MEMORY)");
}

} // namespace
