// Looks up and opens code pages for the commands.

#include "codepage/code_page.h"

#include "base/errors.h"
#include "base/icu_memory.h"
#include "base/near_names.h"
#include "base/options.h"

#include <algorithm>
#include <set>
#include <unicode/unistr.h>

namespace nls2::tool {

namespace {

// Room for a few characters of any page, with its signature and shifts.
constexpr int32_t fewBytes = 64;

// Null if ICU does not know the name. (ICU would open its default converter for an empty name.)
Converter openNamed(const std::string &name, UErrorCode &status) {
  status = U_ZERO_ERROR;
  Converter opened(name.empty() ? nullptr : ucnv_open(name.c_str(), &status));
  requireMemory(make_status(status));
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

// ICU's converters that have this name, if there are several; else none. ICU also warns about names
// that several standards use for one table.
std::vector<std::string> meaningsOf(const std::string &name) {
  UErrorCode status = U_ZERO_ERROR;
  openNamed(name, status);
  std::vector<std::string> meanings;
  for (int32_t i = 0; status == U_AMBIGUOUS_ALIAS_WARNING && i < ucnv_countAvailable(); ++i) {
    const char *converter = ucnv_getAvailableName(i);
    const std::vector<std::string> aliases = aliasesOf(converter);
    if (std::ranges::any_of(aliases, [&](const std::string &alias) {
          return ucnv_compareNames(alias.c_str(), name.c_str()) == 0;
        })) {
      meanings.emplace_back(converter);
    }
  }
  return meanings.size() > 1 ? meanings : std::vector<std::string>();
}

// The number that opens the same converter as the name: that of the Windows name, else the CCSID or
// a number that nls2.h lists. Nothing if the name is the name of several tables.
std::optional<int32_t> numberOf(const std::string &name) {
  const auto windows = windowsPage(name);
  const auto converter = converterOf(name);
  const auto opensIt = [&](std::optional<int32_t> number) {
    return number && converterOf(*number) == converter;
  };
  if (!converter || opensIt(windows)) {
    return windows;
  }
  if (!meaningsOf(name).empty()) {
    return {};
  }
  if (const auto ccsid = ccsidOf(name); opensIt(ccsid)) {
    return ccsid;
  }
  const auto *found = std::ranges::find_if(pagesWithNames, opensIt);
  return found != pagesWithNames.end() ? std::optional(*found) : std::nullopt;
}

// All names and aliases of ICU's converters, and the library's Windows names.
std::vector<std::string> allPageNames() {
  std::vector<std::string> names;
  for (int32_t i = 0; i < ucnv_countAvailable(); ++i) {
    const std::vector<std::string> aliases = aliasesOf(ucnv_getAvailableName(i));
    names.insert(names.end(), aliases.begin(), aliases.end());
  }
  for (const CcsidMapEntry &entry : windows_names()) {
    names.emplace_back(entry.name);
  }
  return names;
}

Error unknownPage(const char *option, const std::string &text) {
  return usageError("{}: unknown code page {}{}; `nls2 codepages --names` lists the names", option,
                    text.empty() ? "\"\"" : printable(text), nearPages(text));
}

} // namespace

std::optional<std::string> converterOf(int32_t number) {
  std::array<char, UCNV_MAX_CONVERTER_NAME_LENGTH> name{};
  const std::error_code error =
      make_status(NLS2_GetCodepageName(number, name.data(), static_cast<uint32_t>(name.size())));
  requireMemory(error);
  return error ? std::nullopt : std::optional<std::string>(name.data());
}

std::optional<std::string> converterOf(const std::string &name) {
  UErrorCode status = U_ZERO_ERROR;
  const Converter converter = openNamed(name, status);
  const char *canonical = converter ? ucnv_getName(converter.get(), &status) : nullptr;
  return canonical != nullptr ? std::optional<std::string>(canonical) : std::nullopt;
}

std::optional<int32_t> ccsidOf(const std::string &name) {
  UErrorCode error = U_ZERO_ERROR;
  const Converter opened = openNamed(name, error);
  const int32_t number = opened ? ucnv_getCCSID(opened.get(), &error) : 0;
  if (!opened || U_FAILURE(error) || number != 0) {
    return opened && U_SUCCESS(error) ? std::optional(number) : std::nullopt;
  }
  int32_t status = 0;
  const auto windows = static_cast<int32_t>(NLS2_MapWindowsNameToCCSID(name.c_str(), &status));
  return windows != 0 ? std::optional(windows) : std::nullopt;
}

std::optional<int32_t> windowsPage(const std::string &name) {
  for (const CcsidMapEntry &entry : windows_names()) {
    if (entry.name == name) {
      return static_cast<int32_t>(entry.ccsid);
    }
  }
  return {};
}

std::set<std::string> namesWithNumbers() {
  const std::vector<std::string> all = allPageNames();
  std::set<std::string> names(all.begin(), all.end());
  std::erase_if(names, [](const std::string &name) { return !numberOf(name); });
  return names;
}

std::string nearPages(const std::string &asked) {
  if (!wholeNumber<int32_t>(asked)) {
    return didYouMean(nearNames(asked, allPageNames()));
  }
  const auto page = windowsPage("windows-" + asked);
  return page ? didYouMean({std::to_string(*page)}) : "";
}

int32_t parsePage(const char *option, const std::string &text) {
  if (const auto number = wholeNumber<int32_t>(text)) {
    return *number;
  }
  if (const auto number = numberOf(text)) {
    return *number;
  }
  if (const auto meanings = meaningsOf(text); !meanings.empty()) {
    throw usageError("{}: {} is the name of several tables{}", option, printable(text),
                     didYouMean(meanings));
  }
  if (converterOf(text)) {
    throw usageError("{}: the library has no number for code page {}; `nls2 codepages` lists "
                     "the numbers",
                     option, printable(text));
  }
  throw unknownPage(option, text);
}

Converter openEncoding(const char *option, const std::string &text) {
  if (const auto number = wholeNumber<int32_t>(text)) {
    return CodePage(*number, option).take();
  }
  UErrorCode error = U_ZERO_ERROR;
  if (Converter opened = openNamed(text, error)) {
    return opened;
  }
  throw unknownPage(option, text);
}

CodePage::CodePage(int32_t number, const char *option) : number_(number) {
  int32_t twoNulls = 0;
  int32_t status = 0;
  converter_.reset(NLS2_MapCodepageIdToName(number, &twoNulls, &status));
  if (!converter_) {
    throw usageError("{}: code page {} does not open: {}{}; `nls2 codepages` lists the numbers",
                     option, number, statusText(status), nearPages(std::to_string(number)));
  }
}

// Encodes the character once and twice: only the first can carry a signature, so the difference is
// the character alone.
std::optional<EncodedCharacter> CodePage::encoded(char16_t character) const {
  const auto encode = [this](const icu::UnicodeString &text) {
    std::string bytes(fewBytes, '\0');
    UErrorCode error = U_ZERO_ERROR;
    const int32_t length = text.extract(bytes.data(), fewBytes, converter(), error);
    bytes.resize(U_FAILURE(error) ? 0 : static_cast<std::size_t>(length));
    return bytes;
  };
  const icu::UnicodeString text(character);
  const std::string one = encode(text);
  const std::string two = encode(text + text);
  UErrorCode error = U_ZERO_ERROR;
  const icu::UnicodeString back(one.data(), static_cast<int32_t>(one.size()), converter(), error);
  requireMemory();
  if (U_FAILURE(error) || back != text) {
    return {};
  }
  return EncodedCharacter{two.substr(one.size()), 2 * one.size() - two.size()};
}

} // namespace nls2::tool
