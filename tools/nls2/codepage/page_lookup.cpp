// What code page numbers and names open, for `codepages` and `locales`.

#include "codepage/page_lookup.h"

#include "codepage/code_page.h"
#include "nls2/code_page.hpp"

#include <algorithm>
#include <array>
#include <fmt/ranges.h>
#include <set>
#include <unicode/ucnv.h>

namespace nls2::tool {

namespace {

constexpr std::array prefixes{"ibm-", "cp", "windows-"}; // people write these before numbers

// The numbers that nls2.h lists. What they open is found by asking the library.
constexpr std::array<int32_t, 25> pagesWithNames{
    874,   932,   936,   949,   950,   1200,  1208,  57352, 57355, 57356, 57357, 57358, 57359,
    57360, 57361, 57362, 57363, 57365, 57366, 57367, 57368, 57369, 57370, 57371, 57372};

// The facts about a number or name; nothing if it does not open.
std::optional<NLS2F_PageFacts> factsOf(const std::string &asked) {
  auto facts = sized<NLS2F_PageFacts>();
  const Page page = openPage(asked);
  if (!page) {
    return {};
  }
  isDone(NLS2F_PageInfo(page.get(), &facts));
  return facts;
}

std::optional<std::string> converterOf(const std::string &asked) {
  const auto facts = factsOf(asked);
  return facts ? std::optional<std::string>(facts->name) : std::nullopt;
}

std::vector<std::string> windowsNamesOf(int32_t number) {
  std::vector<std::string> names;
  for (const CcsidMapEntry &entry : windows_names()) {
    if (entry.ccsid == static_cast<uint32_t>(number)) {
      names.emplace_back(entry.name);
    }
  }
  return names;
}

Answer answerFor(int32_t number) {
  constexpr std::array kinds{"", "single-byte", "mixed", "unicode", "other"};
  const auto facts = factsOf(std::to_string(number));
  std::string text = fmt::format("Code page {}\n", number);
  const auto line = [&](const char *what, const std::string &value) {
    text += fmt::format("  {:<20} {}\n", what, value);
  };
  const char *kind = facts ? kinds[static_cast<std::size_t>(facts->kind)] : nullptr;
  line("opens", facts ? facts->name : "nothing in this ICU");
  if (facts) {
    line("kind", fmt::format("{}{}{}", kind, facts->hasStates != 0 ? ", with states" : "",
                             facts->hasSignature != 0 ? ", with a signature" : ""));
  }
  for (const std::string &name : windowsNamesOf(number)) {
    line("Windows name", name);
  }
  return {text, Json::object({{"codepage", number},
                              {"converter", facts ? Json(facts->name) : Json()},
                              {"kind", kind},
                              {"has_states", facts && facts->hasStates != 0},
                              {"has_signature", facts && facts->hasSignature != 0},
                              {"windows_names", Json::array(windowsNamesOf(number))}})};
}

// The numbers that a name may mean: that which opens the same table, the library's Windows name,
// and the number inside the name (1252 in windows-1252).
std::set<int32_t> numbersOf(const std::string &name) {
  std::set<int32_t> numbers;
  if (const auto facts = factsOf(name); facts && facts->number != 0) {
    numbers.insert(facts->number);
  }
  for (const CcsidMapEntry &entry : windows_names()) {
    if (entry.name == name) {
      numbers.insert(static_cast<int32_t>(entry.ccsid));
    }
  }
  for (const std::string prefix : prefixes) {
    const auto inside =
        wholeNumber<int32_t>(name.starts_with(prefix) ? name.substr(prefix.size()) : "");
    if (inside && openPage(std::to_string(*inside))) {
      numbers.insert(*inside);
    }
  }
  return numbers;
}

// The usual names of a number, as far as ICU knows them.
std::vector<std::string> namesOf(int32_t number) {
  std::vector<std::string> names;
  for (const char *prefix : prefixes) {
    if (std::string name = fmt::format("{}{}", prefix, number); openPage(name)) {
      names.push_back(std::move(name));
    }
  }
  return names;
}

Answer describe(const std::set<int32_t> &numbers, const std::vector<std::string> &names) {
  std::string text;
  Json numberRows = Json::array();
  Json nameRows = Json::array();
  std::set<std::optional<std::string>> tables;
  for (const int32_t number : numbers) {
    const Answer answer = answerFor(number);
    text += answer.text;
    numberRows.append(answer.json);
    tables.insert(converterOf(std::to_string(number)));
  }
  for (const std::string &name : names) {
    const auto converter = converterOf(name);
    text += fmt::format("The name {} opens {}\n", name, converter.value_or("nothing in this ICU"));
    nameRows.append(Json::object({{"name", name}, {"converter", converter}}));
    tables.insert(converter);
  }
  tables.erase(std::nullopt);
  const bool differ = tables.size() > 1;
  return {text + (differ ? "Warning: these open different tables.\n" : ""),
          Json::object({{"numbers", numberRows}, {"names", nameRows}, {"tables_differ", differ}})};
}

} // namespace

Answer describePage(int32_t number) { return answerFor(number); }

Answer lookUpPage(const std::string &asked) {
  if (const auto number = wholeNumber<int32_t>(asked);
      number &&
      (std::ranges::find(pagesWithNames, *number) != pagesWithNames.end() || openPage(asked))) {
    return describe({*number}, namesOf(*number));
  }
  const std::string name = wholeNumber<int32_t>(asked) ? "windows-" + asked : asked;
  const auto numbers = numbersOf(name);
  if (numbers.empty() && !openPage(name)) {
    throw failure("code page \"{}\" is unknown: ICU has no such page{}", printable(asked),
                  nearPages(asked));
  }
  return describe(numbers, {name});
}

Answer allPages() {
  std::string text = "Numbers opened by name (any other number is opened as a CCSID):\n";
  Json numbers = Json::array();
  Json names = Json::array();
  for (const int32_t number : pagesWithNames) {
    text += fmt::format("{:>6}  {}\n", number,
                        converterOf(std::to_string(number)).value_or("nothing in this ICU"));
    numbers.append(answerFor(number).json);
  }
  text += "\nWindows names:\n";
  for (const auto &[name, number] : windows_names()) {
    text += fmt::format("{:>6}  {}\n", number, name);
    names.append(Json::object({{"name", name}, {"codepage", number}}));
  }
  return {text, Json::object({{"windows_names", names}, {"numbers", numbers}})};
}

// Digits alone are a number.
Answer allPageNames() {
  std::set<std::string> names;
  int64_t pages = 0;
  isDone(NLS2F_PageCount(&pages));
  for (int64_t i = 0; i < pages; ++i) {
    const char *page = "";
    UErrorCode status = U_ZERO_ERROR;
    isDone(NLS2F_PageAt(i, &page));
    const uint16_t count = ucnv_countAliases(page, &status);
    for (uint16_t alias = 0; alias < count && U_SUCCESS(status); ++alias) {
      const std::string name = ucnv_getAlias(page, alias, &status);
      if (!wholeNumber<int32_t>(name)) {
        names.insert(name);
      }
    }
  }
  return {fmt::format("{}\n", fmt::join(names, "\n")), Json::array(names)};
}

} // namespace nls2::tool
