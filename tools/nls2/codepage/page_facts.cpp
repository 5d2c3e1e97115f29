// What the library and ICU make of code pages, as text and as JSON.

#include "codepage/page_facts.h"

#include "codepage/code_page.h"
#include "options.h"

#include <algorithm>
#include <iterator>
#include <new>
#include <set>

namespace nls2::tool {

namespace {

constexpr const char *prefixes[] = {"ibm-", "cp", "windows-"}; // that people write before numbers

// The 1252 of "windows-1252": the number that somebody who knows the name would write.
std::optional<int32_t> numberInside(const std::string &name) {
  for (const std::string prefix : prefixes) {
    if (name.starts_with(prefix)) {
      return pageNumber(name.substr(prefix.size()));
    }
  }
  return {};
}

// ICU's number of the name, that of the library's Windows names, and the one inside the name; for a
// name without any of them, the numbers that the library opens as the same converter.
std::vector<int32_t> numbersOf(const std::string &name) {
  std::vector<int32_t> numbers;
  const auto add = [&](std::optional<int32_t> number) {
    if (number && std::find(numbers.begin(), numbers.end(), *number) == numbers.end()) {
      numbers.push_back(*number);
    }
  };
  add(ccsidOf(name));
  int32_t status = U_ZERO_ERROR;
  const uint32_t windows = NLS2_MapWindowsNameToCCSID(name.c_str(), &status);
  if (status == U_ZERO_ERROR) {
    add(static_cast<int32_t>(windows));
  }
  if (const auto inside = numberInside(name); inside && converterOf(*inside)) {
    add(inside);
  }
  if (const auto converter = converterOf(name); numbers.empty() && converter) {
    std::copy_if(pagesWithNames.begin(), pagesWithNames.end(), std::back_inserter(numbers),
                 [&](int32_t number) { return converterOf(number) == converter; });
  }
  return numbers;
}

FoundPages lookUpName(const std::string &name) {
  FoundPages found{.numbers = {}, .names = {{name, converterOf(name)}}};
  for (const int32_t number : name.empty() ? std::vector<int32_t>() : numbersOf(name)) {
    found.numbers.push_back(describePage(number));
  }
  if (found.numbers.empty() && !found.names[0].converter) {
    throw failure("code page \"{}\" is unknown: it is neither a name that ICU has a converter for "
                  "nor a Windows name of the library's{}",
                  printable(name), nearPages(name));
  }
  return found;
}

// With the names that people write for the number, as far as ICU has them.
FoundPages describeNumber(int32_t number) {
  FoundPages found{.numbers = {describePage(number)}, .names = {}};
  for (const char *prefix : prefixes) {
    const std::string name = fmt::format("{}{}", prefix, number);
    if (auto converter = converterOf(name)) {
      found.names.push_back({name, std::move(converter)});
    }
  }
  return found;
}

} // namespace

bool FoundPages::tablesDiffer() const {
  std::set<std::optional<std::string>> tables;
  for (const PageFacts &facts : numbers) {
    tables.insert(facts.converter);
  }
  for (const NameFacts &facts : names) {
    tables.insert(facts.converter);
  }
  tables.erase(std::nullopt);
  return tables.size() > 1;
}

PageFacts describePage(int32_t number) {
  PageFacts facts;
  facts.number = number;
  facts.converter = converterOf(number);
  int32_t twoNull = 0;
  const nls2::converter converter(NLS2_MapCodepageIdToName(number, &twoNull, &facts.status));
  if (facts.status == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc(); // a page that would open must not be called one that does not
  }
  facts.hasTwoNulls = twoNull != 0;
  facts.opens = static_cast<bool>(converter);
  facts.ccsid = facts.converter ? ccsidOf(*facts.converter) : std::nullopt;
  if (converter) {
    facts.maxCharSize = ucnv_getMaxCharSize(converter.get());
  }
  for (const CcsidMapEntry &entry : windows_names()) {
    if (entry.ccsid == static_cast<uint32_t>(number)) {
      facts.windowsNames.emplace_back(entry.name);
    }
  }
  return facts;
}

FoundPages lookUpPage(const std::string &asked) {
  const auto given = wholeNumber(asked);
  if (!given) {
    return lookUpName(asked);
  }
  const auto number = pageNumber(asked);
  const auto *listed = std::find(pagesWithNames.begin(), pagesWithNames.end(), number);
  if (number && (listed != pagesWithNames.end() || converterOf(*number))) {
    return describeNumber(*number);
  }
  const std::string windowsName = fmt::format("windows-{}", *given);
  if (windowsPage(windowsName)) {
    return lookUpName(windowsName);
  }
  throw failure("code page {} is unknown: it is not one of the library's numbers, and ICU has no "
                "converter for it as a CCSID",
                *given);
}

std::string asText(const PageFacts &facts) {
  std::string text = fmt::format("Code page {}\n", facts.number);
  const auto line = [&](const char *what, const std::string &value) {
    text += fmt::format("  {:<20} {}\n", what, value);
  };
  line("opens", facts.opens ? "yes" : "no: " + statusText(facts.status));
  if (facts.opens) {
    line("converter", facts.converter.value_or("without a name"));
    line("CCSID", facts.ccsid ? std::to_string(*facts.ccsid) : "none");
    line("largest character",
         fmt::format("{} byte(s) a UTF-16 unit", facts.maxCharSize.value_or(0)));
  }
  line("two-null terminator", facts.hasTwoNulls ? "yes" : "no");
  for (const std::string &name : facts.windowsNames) {
    line("Windows name", name);
  }
  return text;
}

std::string asText(const FoundPages &found) {
  std::string text;
  for (const PageFacts &facts : found.numbers) {
    text += asText(facts);
  }
  if (found.numbers.empty()) {
    text += "No number of the library's opens this code page.\n";
  }
  for (const NameFacts &facts : found.names) {
    text += fmt::format("The name {} opens {}\n", facts.name,
                        facts.converter.value_or("nothing in this ICU"));
  }
  return found.tablesDiffer() ? text + "Beware: these open different tables.\n" : text;
}

Json asJson(const PageFacts &facts) {
  return Json::object(
      {{"codepage", facts.number},
       {"opens", facts.opens},
       {"converter", facts.converter},
       {"ccsid", facts.ccsid},
       {"twoNullTerminator", facts.hasTwoNulls},
       {"maxCharSize", facts.maxCharSize},
       {"windowsNames", Json::array(facts.windowsNames)},
       {"status", facts.status},
       // ICU's name of the status, for programs; people get statusText().
       {"statusName",
        fmt::format("{} ({})", u_errorName(static_cast<UErrorCode>(facts.status)), facts.status)}});
}

Json asJson(const FoundPages &found) {
  const auto numberAsJson = [](const PageFacts &facts) { return asJson(facts); };
  const auto nameAsJson = [](const NameFacts &facts) {
    return Json::object({{"name", facts.name}, {"converter", facts.converter}});
  };
  return Json::object({{"numbers", Json::array(found.numbers, numberAsJson)},
                       {"names", Json::array(found.names, nameAsJson)},
                       {"tablesDiffer", found.tablesDiffer()}});
}

std::string allPagesAsText() {
  std::string text = "Numbers opened by name (any other number is opened as a CCSID of ICU's):\n";
  for (const int32_t number : pagesWithNames) {
    const PageFacts facts = describePage(number);
    text += fmt::format("{:>6}  {}{}\n", number,
                        facts.opens ? facts.converter.value_or("without a name")
                                    : "does not open: " + statusText(facts.status),
                        facts.hasTwoNulls ? ", two-null terminator" : "");
  }
  text += "\nWindows names:\n";
  for (const CcsidMapEntry &entry : windows_names()) {
    text += fmt::format("{:>6}  {}\n", entry.ccsid, entry.name);
  }
  return text;
}

Json allPagesAsJson() {
  const auto nameAsJson = [](const CcsidMapEntry &entry) {
    return Json::object({{"name", entry.name}, {"codepage", entry.ccsid}});
  };
  const auto numberAsJson = [](int32_t number) { return asJson(describePage(number)); };
  return Json::object({{"windowsNames", Json::array(windows_names(), nameAsJson)},
                       {"numbers", Json::array(pagesWithNames, numberAsJson)}});
}

} // namespace nls2::tool
