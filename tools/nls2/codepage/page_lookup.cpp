// What code page numbers and names open, for `codepages` and `locales`.

#include "codepage/page_lookup.h"

#include "base/icu_memory.h"
#include "codepage/code_page.h"

#include <algorithm>
#include <iterator>
#include <set>

namespace nls2::tool {

namespace {

constexpr std::array prefixes{"ibm-", "cp", "windows-"}; // people write these before numbers

// Only the first three are set if the number does not open.
struct PageFacts {
  int32_t number = 0;
  int32_t status = 0;
  int32_t twoNulls = 0;
  bool opens = false;
  std::optional<std::string> converter; // nothing if it has no name
  std::optional<int32_t> ccsid;
  std::optional<int32_t> maxCharSize;

  std::string name() const { return converter.value_or("without a name"); }
};

PageFacts factsOf(int32_t number) {
  PageFacts facts;
  facts.number = number;
  const Converter opened(NLS2_MapCodepageIdToName(number, &facts.twoNulls, &facts.status));
  requireMemory(make_status(facts.status));
  if (opened) {
    facts.opens = true;
    facts.converter = converterOf(number);
    facts.ccsid = facts.converter ? ccsidOf(*facts.converter) : std::nullopt;
    facts.maxCharSize = ucnv_getMaxCharSize(opened.get());
  }
  return facts;
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

std::string textOf(const PageFacts &facts) {
  std::string text = fmt::format("Code page {}\n", facts.number);
  const auto line = [&](const char *what, const std::string &value) {
    text += fmt::format("  {:<20} {}\n", what, value);
  };
  line("opens", facts.opens ? "yes" : "no: " + statusText(facts.status));
  if (facts.opens) {
    line("converter", facts.name());
    line("CCSID", facts.ccsid ? std::to_string(*facts.ccsid) : "none");
    line("largest character", fmt::format("{} byte(s) per UTF-16 unit", *facts.maxCharSize));
  }
  line("two-null terminator", facts.twoNulls != 0 ? "yes" : "no");
  for (const std::string &name : windowsNamesOf(facts.number)) {
    line("Windows name", name);
  }
  return text;
}

Json jsonOf(const PageFacts &facts) {
  return Json::object(
      {{"codepage", facts.number},
       {"opens", facts.opens},
       {"converter", facts.converter},
       {"ccsid", facts.ccsid},
       {"twoNullTerminator", facts.twoNulls != 0},
       {"maxCharSize", facts.maxCharSize},
       {"windowsNames", Json::array(windowsNamesOf(facts.number))},
       {"status", facts.status},
       // ICU's name of the status is for programs; people get statusText().
       {"statusName",
        fmt::format("{} ({})", u_errorName(static_cast<UErrorCode>(facts.status)), facts.status)}});
}

// The numbers that a name may mean: ICU's CCSID, the library's Windows name, and the number inside
// the name (1252 in windows-1252). If there are none, the listed numbers that open the same
// converter.
std::vector<int32_t> numbersOf(const std::string &name) {
  std::vector<int32_t> numbers;
  const auto add = [&](std::optional<int32_t> number) {
    if (number && std::ranges::find(numbers, *number) == numbers.end()) {
      numbers.push_back(*number);
    }
  };
  add(ccsidOf(name));
  int32_t status = U_ZERO_ERROR;
  const uint32_t windows = NLS2_MapWindowsNameToCCSID(name.c_str(), &status);
  if (status == U_ZERO_ERROR) {
    add(static_cast<int32_t>(windows));
  }
  for (const std::string prefix : prefixes) {
    const auto inside =
        wholeNumber<int32_t>(name.starts_with(prefix) ? name.substr(prefix.size()) : "");
    add(inside && converterOf(*inside) ? inside : std::nullopt);
  }
  if (const auto converter = converterOf(name); numbers.empty() && converter) {
    std::ranges::copy_if(pagesWithNames, std::back_inserter(numbers),
                         [&](int32_t number) { return converterOf(number) == converter; });
  }
  return numbers;
}

// The usual names of a number, as far as ICU knows them.
std::vector<std::string> namesOf(int32_t number) {
  std::vector<std::string> names;
  for (const char *prefix : prefixes) {
    if (std::string name = fmt::format("{}{}", prefix, number); converterOf(name)) {
      names.push_back(std::move(name));
    }
  }
  return names;
}

Answer describe(const std::vector<int32_t> &numbers, const std::vector<std::string> &names) {
  std::string text = numbers.empty() ? "The library has no number for this code page.\n" : "";
  Json numberRows = Json::array();
  Json nameRows = Json::array();
  std::set<std::optional<std::string>> tables;
  for (const int32_t number : numbers) {
    const PageFacts facts = factsOf(number);
    text += textOf(facts);
    numberRows.append(jsonOf(facts));
    tables.insert(facts.converter);
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
          Json::object({{"numbers", numberRows}, {"names", nameRows}, {"tablesDiffer", differ}})};
}

} // namespace

Answer describePage(int32_t number) {
  const PageFacts facts = factsOf(number);
  return {textOf(facts), jsonOf(facts)};
}

Answer lookUpPage(const std::string &asked) {
  std::string name = asked;
  if (const auto number = wholeNumber<int32_t>(asked)) {
    if (std::ranges::find(pagesWithNames, *number) != pagesWithNames.end() ||
        converterOf(*number)) {
      return describe({*number}, namesOf(*number));
    }
    name = fmt::format("windows-{}", *number);
    if (!windowsPage(name)) {
      throw failure("code page {} is unknown: the library does not list it, and ICU has no "
                    "converter with this CCSID",
                    *number);
    }
  }
  const auto numbers = name.empty() ? std::vector<int32_t>() : numbersOf(name);
  if (numbers.empty() && !converterOf(name)) {
    throw failure(
        "code page \"{}\" is unknown: neither ICU nor the library's list of Windows names "
        "has it{}",
        printable(name), nearPages(name));
  }
  return describe(numbers, {name});
}

Answer allPages() {
  std::string text = "Numbers opened by name (any other number is opened as a CCSID):\n";
  Json numbers = Json::array();
  Json names = Json::array();
  for (const int32_t number : pagesWithNames) {
    const PageFacts facts = factsOf(number);
    text += fmt::format("{:>6}  {}{}\n", number,
                        facts.opens ? facts.name() : "does not open: " + statusText(facts.status),
                        facts.twoNulls != 0 ? ", two-null terminator" : "");
    numbers.append(jsonOf(facts));
  }
  text += "\nWindows names:\n";
  for (const auto &[name, number] : windows_names()) {
    text += fmt::format("{:>6}  {}\n", number, name);
    names.append(Json::object({{"name", name}, {"codepage", number}}));
  }
  return {text, Json::object({{"windowsNames", names}, {"numbers", numbers}})};
}

} // namespace nls2::tool
