// Names of code pages: which numbers and converters they stand for, and names near to them.

#include "codepage/page_names.h"

#include "memory.h"
#include "near_names.h"
#include "nls2/code_page.hpp"
#include "options.h"

#include <algorithm>

namespace nls2::tool {

namespace {

// Null where ICU does not know the name. An empty one would be its default converter.
nls2::converter openNamed(const std::string &name, UErrorCode &status) {
  status = U_ZERO_ERROR;
  nls2::converter opened(name.empty() ? nullptr : ucnv_open(name.c_str(), &status));
  requireMemory();
  return opened;
}

std::vector<std::string> aliasesOf(const char *converter) {
  std::vector<std::string> aliases;
  UErrorCode status = U_ZERO_ERROR;
  const uint16_t count = ucnv_countAliases(converter, &status);
  for (uint16_t i = 0; i < count && U_SUCCESS(status); ++i) {
    aliases.emplace_back(ucnv_getAlias(converter, i, &status));
  }
  return aliases;
}

} // namespace

std::optional<std::string> converterOf(int32_t number) {
  char name[UCNV_MAX_CONVERTER_NAME_LENGTH];
  const int32_t status = NLS2_GetCodepageName(number, name, sizeof name);
  return status > U_ZERO_ERROR ? std::nullopt : std::optional<std::string>(name);
}

std::optional<std::string> converterOf(const std::string &name) {
  UErrorCode status = U_ZERO_ERROR;
  const nls2::converter converter = openNamed(name, status);
  const char *canonical = converter ? ucnv_getName(converter.get(), &status) : nullptr;
  return canonical != nullptr ? std::optional<std::string>(canonical) : std::nullopt;
}

// The library is asked only where it finds a number: it leaks its converter otherwise.
std::optional<int32_t> ccsidOf(const std::string &name) {
  UErrorCode error = U_ZERO_ERROR;
  const nls2::converter converter = openNamed(name, error);
  if (!converter) {
    return {};
  }
  int32_t status = U_ZERO_ERROR;
  const bool isNumbered = ucnv_getCCSID(converter.get(), &error) != 0;
  const uint32_t number = isNumbered ? NLS2_GetCodepageId(name.c_str(), &status)
                                     : NLS2_MapWindowsNameToCCSID(name.c_str(), &status);
  return status == U_ZERO_ERROR ? std::optional(static_cast<int32_t>(number)) : std::nullopt;
}

std::vector<std::string> windowsNamesOf(int32_t number) {
  std::vector<std::string> names;
  for (const CcsidMapEntry *entry = ccsidMap; entry->ccsid != NLS2_CCSID_MAP_END; ++entry) {
    if (entry->ccsid == static_cast<uint32_t>(number)) {
      names.emplace_back(entry->name);
    }
  }
  return names;
}

std::optional<int32_t> windowsPage(const std::string &name) {
  for (const CcsidMapEntry *entry = ccsidMap; entry->ccsid != NLS2_CCSID_MAP_END; ++entry) {
    if (entry->name == name) {
      return static_cast<int32_t>(entry->ccsid);
    }
  }
  return {};
}

// ICU warns of names that several standards use, too: they are ambiguous only if the tables differ.
std::vector<std::string> meaningsOf(const std::string &name) {
  UErrorCode status = U_ZERO_ERROR;
  openNamed(name, status);
  std::vector<std::string> meanings;
  for (int32_t i = 0; status == U_AMBIGUOUS_ALIAS_WARNING && i < ucnv_countAvailable(); ++i) {
    const char *converter = ucnv_getAvailableName(i);
    const std::vector<std::string> aliases = aliasesOf(converter);
    if (std::any_of(aliases.begin(), aliases.end(), [&](const std::string &alias) {
          return ucnv_compareNames(alias.c_str(), name.c_str()) == 0;
        })) {
      meanings.emplace_back(converter);
    }
  }
  return meanings.size() > 1 ? meanings : std::vector<std::string>();
}

std::optional<int32_t> numberOf(const std::string &name) {
  const std::optional<int32_t> windows = windowsPage(name);
  const std::optional<std::string> converter = converterOf(name);
  if (!converter) {
    return windows;
  }
  const auto opensIt = [&](int32_t number) { return converterOf(number) == converter; };
  if (windows && opensIt(*windows)) {
    return windows;
  }
  if (!meaningsOf(name).empty()) {
    return {};
  }
  if (const std::optional<int32_t> ccsid = ccsidOf(name); ccsid && opensIt(*ccsid)) {
    return ccsid;
  }
  const auto found = std::find_if(pagesWithNames.begin(), pagesWithNames.end(), opensIt);
  return found != pagesWithNames.end() ? std::optional(*found) : std::nullopt;
}

std::vector<std::string> allPageNames() {
  std::vector<std::string> names;
  for (int32_t i = 0; i < ucnv_countAvailable(); ++i) {
    const std::vector<std::string> aliases = aliasesOf(ucnv_getAvailableName(i));
    names.insert(names.end(), aliases.begin(), aliases.end());
  }
  for (const CcsidMapEntry *entry = ccsidMap; entry->ccsid != NLS2_CCSID_MAP_END; ++entry) {
    names.emplace_back(entry->name);
  }
  return names;
}

std::vector<std::string> namesWithNumbers() {
  std::vector<std::string> names = allPageNames();
  std::erase_if(names, [](const std::string &name) { return !numberOf(name); });
  std::sort(names.begin(), names.end());
  names.erase(std::unique(names.begin(), names.end()), names.end());
  return names;
}

std::string nearPages(const std::string &asked) {
  if (const auto number = wholeNumber(asked)) {
    const auto page = windowsPage(fmt::format("windows-{}", *number));
    return page ? didYouMean({fmt::format("{}", *page)}) : "";
  }
  return didYouMean(nearNames(asked, allPageNames()));
}

} // namespace nls2::tool
