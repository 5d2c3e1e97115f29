// What the library and ICU make of one code page.

#include "codepage/codepage_lookup.h"

#include "codepage/page_names.h"
#include "nls2/code_page.hpp"
#include "options.h"

#include <algorithm>
#include <iterator>
#include <new>
#include <set>

namespace nls2::tool {

namespace {

bool isListed(int32_t number) {
  return std::find(pagesWithNames.begin(), pagesWithNames.end(), number) != pagesWithNames.end();
}

// The number of text that is one the library may open.
std::optional<int32_t> pageNumber(const std::string &text) {
  const auto number = wholeNumber(text);
  return number && *number <= std::numeric_limits<int32_t>::max()
             ? std::optional(static_cast<int32_t>(*number))
             : std::nullopt;
}

// The 1252 of "windows-1252": the number that somebody who knows the name would write.
std::optional<int32_t> numberInside(const std::string &name) {
  for (const std::string prefix : {"ibm-", "cp", "windows-"}) {
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

// Names that people write for a number, as far as ICU has them.
std::vector<std::string> spellingsOf(int32_t number) {
  std::vector<std::string> names;
  for (const char *prefix : {"ibm-", "cp", "windows-"}) {
    std::string name = fmt::format("{}{}", prefix, number);
    if (converterOf(name)) {
      names.push_back(std::move(name));
    }
  }
  return names;
}

FoundPages found(const std::vector<int32_t> &numbers, const std::vector<std::string> &names) {
  FoundPages result;
  std::set<std::string> tables;
  const auto note = [&](const std::optional<std::string> &table) {
    if (table) {
      tables.insert(*table);
    }
  };
  for (const int32_t number : numbers) {
    result.numbers.push_back(describePage(number));
    note(result.numbers.back().converter);
  }
  for (const std::string &name : names) {
    result.names.push_back({name, converterOf(name)});
    note(result.names.back().converter);
  }
  result.tablesDiffer = tables.size() > 1;
  return result;
}

FoundPages lookUpName(const std::string &name) {
  const std::vector<int32_t> numbers = name.empty() ? std::vector<int32_t>() : numbersOf(name);
  if (numbers.empty() && !converterOf(name)) {
    throw failure("code page \"{}\" is unknown: it is neither a name that ICU has a converter for "
                  "nor a Windows name of the library's{}",
                  printable(name), nearPages(name));
  }
  return found(numbers, {name});
}

FoundPages lookUpNumber(const std::string &asked) {
  const auto number = pageNumber(asked);
  if (number && (isListed(*number) || converterOf(*number))) {
    return found({*number}, spellingsOf(*number));
  }
  const std::string windowsName = fmt::format("windows-{}", *wholeNumber(asked));
  if (windowsPage(windowsName)) {
    return lookUpName(windowsName);
  }
  throw failure("code page {} is unknown: it is not one of the library's numbers, and ICU has no "
                "converter for it as a CCSID",
                *wholeNumber(asked));
}

} // namespace

PageFacts describePage(int32_t number) {
  PageFacts facts;
  facts.number = number;
  int32_t twoNull = 0;
  const nls2::converter converter(NLS2_MapCodepageIdToName(number, &twoNull, &facts.status));
  if (facts.status == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc(); // a page that would open must not be called one that does not
  }
  facts.hasTwoNulls = twoNull != 0;
  facts.opens = static_cast<bool>(converter);
  facts.converter = converterOf(number);
  facts.ccsid = facts.converter ? ccsidOf(*facts.converter) : std::nullopt;
  if (converter) {
    facts.maxCharSize = ucnv_getMaxCharSize(converter.get());
  }
  facts.windowsNames = windowsNamesOf(number);
  return facts;
}

FoundPages lookUpPage(const std::string &asked) {
  return wholeNumber(asked) ? lookUpNumber(asked) : lookUpName(asked);
}

} // namespace nls2::tool
