// The calls of calls.tsv on locale objects, and on the queries that these rest on.

#include "locale/scenario.h"

#include <cstdio>
#include <fstream>
#include <gtest/gtest.h>
#include <map>

namespace {

using support::said;
using Words = std::vector<std::string>;

Words split(const std::string &text, char separator) {
  std::istringstream stream(text);
  Words words;
  for (std::string word; std::getline(stream, word, separator);) {
    words.push_back(word);
  }
  return words;
}

const char *textOrNull(const std::string &word) { return word == "null" ? nullptr : word.c_str(); }

uint32_t number(const std::string &word) {
  return static_cast<uint32_t>(std::stoll(word, nullptr, 0));
}

// "A" is the first of the objects that were made before.
NLS2_Locale *object(const std::string &word) {
  static NLS2_Locale copy;
  if (word == "copy") {
    copy = *support::live(0);
    return &copy;
  }
  return word == "null"    ? nullptr
         : word == "never" ? &support::never
                           : support::live(word[0] - 'A');
}

// The status, and what else the call gives.
template <class Function, class... Arguments>
std::string withStatus(Function function, Arguments... arguments) {
  int32_t status = -1;
  const auto value = function(arguments..., &status);
  if constexpr (std::is_pointer_v<decltype(value)>) {
    return said(status, value != nullptr ? "object" : "null");
  } else {
    return said(status, value);
  }
}

std::string init(const Words & /*word*/) {
  [[maybe_unused]] const support::MeantLeak converterWithoutNumber;
  NLS2_Locale object = {};
  const int32_t status = NLS2_initLocaleObject(&object);
  return said(status, support::described(object), withStatus(NLS2_allocateLocale));
}

std::string release(const Words &word) {
  NLS2_Locale *const released = object(word[1]);
  const int32_t first = NLS2_ReleaseLocale(released);
  return said(first, NLS2_ReleaseLocale(released));
}

std::string set(const Words &word) {
  NLS2_Locale *const changed = object(word[1]);
  const int32_t status = NLS2_SetLocaleNumInfo(changed, number(word[2]), number(word[3]), 77);
  return said(status, support::described(*changed));
}

// A buffer of dots, with 0 for NUL. What ICU leaves in one that is too small depends on its
// version.
std::string language(const Words &word) {
  std::string buffer = "....";
  const int32_t length = static_cast<int32_t>(number(word[2]));
  const int32_t status = NLS2_GetLanguageName(number(word[1]), buffer.data(), length);
  for (char &byte : buffer) {
    byte = byte == '\0' ? '0' : byte;
  }
  return status == U_BUFFER_OVERFLOW_ERROR ? said(status) : said(status, buffer);
}

std::string posix(const Words &word) {
  char name[16] = "untouched";
  const int32_t status = NLS2_GetShortPosixName(number(word[1]), name, -7);
  return said(status, name);
}

std::string codepageName(const Words &word) {
  char name[60] = "untouched";
  const int32_t status = NLS2_GetCodepageName(static_cast<int32_t>(number(word[1])), name, 0);
  return said(status, name);
}

std::string codepageId(const Words &word) {
  [[maybe_unused]] const support::MeantLeak converterWithoutNumber;
  return withStatus(NLS2_GetCodepageId, word[1].c_str());
}

const std::map<std::string, std::string (*)(const Words &)> functions = {
    {"start", [](const Words &) { return said(NLS2_Init()); }},
    {"init", init},
    {"allocate", [](const Words &) { return withStatus(NLS2_allocateLocale); }},
    {"get",
     [](const Words &word) {
       return withStatus(NLS2_GetLocale, number(word[1]), number(word[2]), number(word[3]));
     }},
    {"thread", [](const Words &) { return said(NLS2_GetThreadLocale() != nullptr); }},
    {"convert",
     [](const Words &word) {
       return withStatus(NLS2_ConvertNativeLocale, nullptr, number(word[1]));
     }},
    {"native",
     [](const Words &word) {
       return said(NLS2_SetLocaleFromNative(word[2].c_str(), number(word[1])));
     }},
    {"validate", [](const Words &word) { return said(NLS2_ValidateLocale(object(word[1]))); }},
    {"release", release},
    {"number",
     [](const Words &word) {
       return withStatus(NLS2_GetLocaleNumInfo, object(word[1]), number(word[2]));
     }},
    {"codepage",
     [](const Words &word) { return withStatus(NLS2_GetLocaleCodepageId, object(word[1])); }},
    {"set", set},
    {"language", language},
    {"posix", posix},
    {"language-id",
     [](const Words &word) {
       return withStatus(NLS2_LanguageIDFromShortPosixName, word[1].c_str());
     }},
    {"codepage-name", codepageName},
    {"codepage-id", codepageId},
};

void apply(const std::string &setting, support::Scenario &scenario, Words &kept) {
  const std::string key = setting.substr(0, setting.find('='));
  const std::string value = setting.substr(key.size() + 1);
  if (key == "locale") {
    scenario.answers.locale = textOrNull(kept.emplace_back(value));
  } else if (key == "codepages") {
    scenario.answers.codepages.clear();
    for (const std::string &name : split(value, ',')) {
      scenario.answers.codepages.push_back(textOrNull(kept.emplace_back(name)));
    }
  } else if (key == "made") {
    scenario.made = std::stoi(value);
  } else if (key == "ccsid") {
    scenario.answers.ccsidError = static_cast<UErrorCode>(std::stoi(value));
  } else if (key == "name") {
    scenario.answers.nameError = static_cast<UErrorCode>(std::stoi(value));
    scenario.answers.noName = true;
  } else {
    ASSERT_EQ(key, "memory");
    scenario.answers.noObjects = true;
  }
}

// A row: name; "traced" or "plain"; the call, a word of `functions` and its arguments, with _ for
// an empty one; its answer; the objects left; what ICU and the heap answer.
TEST(Calls, AnswerTraceAndLeaveWhatIsKnown) {
  std::ifstream rows(CALLS_TSV);
  int ran = 0;
  for (std::string line; std::getline(rows, line);) {
    Words field = split(line, '\t');
    field.resize(6);
    Words kept;
    kept.reserve(8);
    Words word = split(field[2], ' ');
    word.back() = word.back() == "_" ? "" : word.back();
    support::Scenario scenario{field[0], field[1] == "traced" ? support::traced : support::plain,
                               [&] { return functions.at(word[0])(word); }, field[3], field[4]};
    for (const std::string &setting : split(field[5], ' ')) {
      apply(setting, scenario, kept);
    }
    if (!scenario.answers.noObjects || support::objectsCanFail) {
      support::expectScenario(scenario);
    }
    ++ran;
  }
  EXPECT_GT(ran, 0);
}

} // namespace
