// What the library and ICU make of one code page.

#include "codepage/codepage_lookup.h"

#include "errors.h"
#include "nls2.h"
#include "options.h"

#include <algorithm>
#include <fmt/core.h>
#include <limits>
#include <optional>
#include <set>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>
#include <vector>

namespace nls2::tool {

namespace {

using Json = nlohmann::ordered_json;

// Null where the number does not open.
Json canonicalName(int32_t number) {
  char name[UCNV_MAX_CONVERTER_NAME_LENGTH];
  return NLS2_GetCodepageName(number, name, sizeof name) > U_ZERO_ERROR ? Json() : Json(name);
}

// The same of a name, as ICU opens it. An empty name would be its default converter.
Json canonicalName(const std::string &name) {
  if (name.empty()) {
    return {};
  }
  UErrorCode status = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(ucnv_open(name.c_str(), &status));
  if (converter.isNull()) {
    return {};
  }
  const char *canonical = ucnv_getName(converter.getAlias(), &status);
  return canonical != nullptr ? Json(canonical) : Json();
}

// NLS2_GetCodepageId, asked only where it finds a number: it leaks its converter otherwise.
std::optional<uint32_t> codepageId(const std::string &name) {
  UErrorCode error = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(ucnv_open(name.c_str(), &error));
  if (converter.isNull()) {
    return {};
  }
  int32_t status = U_ZERO_ERROR;
  const bool numbered = ucnv_getCCSID(converter.getAlias(), &error) != 0;
  const uint32_t number = numbered ? NLS2_GetCodepageId(name.c_str(), &status)
                                   : NLS2_MapWindowsNameToCCSID(name.c_str(), &status);
  return status == U_ZERO_ERROR ? std::optional(number) : std::nullopt;
}

Json ccsidOf(const Json &name) {
  const auto number = name.is_null() ? std::nullopt : codepageId(name.get<std::string>());
  return number ? Json(*number) : Json();
}

Json windowsNamesOf(int32_t number) {
  Json names = Json::array();
  for (const CcsidMapEntry *entry = ccsidMap; entry->ccsid != NLS2_CCSID_MAP_END; ++entry) {
    if (entry->ccsid == static_cast<uint32_t>(number)) {
      names.push_back(entry->name);
    }
  }
  return names;
}

// Names that people write for a number, as far as ICU has them.
std::vector<std::string> spellingsOf(int32_t number) {
  std::vector<std::string> names;
  for (const char *form : {"ibm-{}", "cp{}", "windows-{}"}) {
    std::string name = fmt::format(fmt::runtime(form), number);
    if (!canonicalName(name).is_null()) {
      names.push_back(std::move(name));
    }
  }
  return names;
}

// The 1252 of "windows-1252": the number that somebody who knows the name would write.
std::optional<uint32_t> numberInside(const std::string &name) {
  for (const std::string prefix : {"ibm-", "cp", "windows-"}) {
    if (name.rfind(prefix, 0) == 0) {
      return wholeNumber(name.substr(prefix.size()));
    }
  }
  return {};
}

// ICU's number of the name, that of the library's Windows names, and the one inside the name; for a
// name without any of them, the numbers that the library opens as the same converter.
std::vector<int32_t> numbersOf(const std::string &name) {
  std::vector<int32_t> numbers;
  const auto add = [&](uint32_t number) {
    const auto signedNumber = static_cast<int32_t>(number);
    if (std::find(numbers.begin(), numbers.end(), signedNumber) == numbers.end()) {
      numbers.push_back(signedNumber);
    }
  };
  if (const auto icuNumber = codepageId(name)) {
    add(*icuNumber);
  }
  int32_t status = U_ZERO_ERROR;
  const uint32_t windowsNumber = NLS2_MapWindowsNameToCCSID(name.c_str(), &status);
  if (status == U_ZERO_ERROR) {
    add(windowsNumber);
  }
  const auto inside = numberInside(name);
  if (inside && !canonicalName(static_cast<int32_t>(*inside)).is_null()) {
    add(*inside);
  }
  const Json canonical = canonicalName(name);
  if (numbers.empty() && !canonical.is_null()) {
    std::copy_if(pagesWithNames.begin(), pagesWithNames.end(), std::back_inserter(numbers),
                 [&](int32_t number) { return canonicalName(number) == canonical; });
  }
  return numbers;
}

Json found(const std::vector<int32_t> &numbers, const std::vector<std::string> &names) {
  Json result = {{"numbers", Json::array()}, {"names", Json::array()}};
  std::set<Json> tables;
  const auto note = [&](const Json &table) {
    if (!table.is_null()) {
      tables.insert(table);
    }
  };
  for (const int32_t number : numbers) {
    result["numbers"].push_back(describeCodepage(number));
    note(result["numbers"].back()["converter"]);
  }
  for (const std::string &name : names) {
    result["names"].push_back({{"name", name}, {"converter", canonicalName(name)}});
    note(result["names"].back()["converter"]);
  }
  result["tablesDiffer"] = tables.size() > 1;
  return result;
}

Json lookUpNumber(uint32_t asked) {
  const auto number = static_cast<int32_t>(asked);
  const bool listed =
      std::find(pagesWithNames.begin(), pagesWithNames.end(), number) != pagesWithNames.end();
  if (asked > std::numeric_limits<int32_t>::max() || (!listed && canonicalName(number).is_null())) {
    throw failure("code page {} is unknown: it is none of the library's numbers, and "
                  "ICU has no converter for it as a CCSID",
                  asked);
  }
  return found({number}, spellingsOf(number));
}

Json lookUpName(const std::string &name) {
  const std::vector<int32_t> numbers = name.empty() ? std::vector<int32_t>() : numbersOf(name);
  const bool opens = !canonicalName(name).is_null();
  if (numbers.empty() && !opens) {
    throw failure("code page \"{}\" is unknown: it is neither a name that ICU has a "
                  "converter for nor a Windows name of the library's",
                  name);
  }
  return found(numbers, {name});
}

std::string orNone(const Json &value, const char *none) {
  return value.is_null() ? none : value.is_string() ? value.get<std::string>() : value.dump();
}

} // namespace

Json describeCodepage(int32_t number) {
  int32_t twoNull = 0;
  int32_t status = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(NLS2_MapCodepageIdToName(number, &twoNull, &status));
  const Json name = canonicalName(number);
  return {{"codepage", number},
          {"opens", !converter.isNull()},
          {"converter", name},
          {"ccsid", ccsidOf(name)},
          {"twoNullTerminator", twoNull != 0},
          {"maxCharSize",
           converter.isNull() ? Json() : Json(ucnv_getMaxCharSize(converter.getAlias()))},
          {"windowsNames", windowsNamesOf(number)},
          {"status", status},
          {"statusName", statusText(status)}};
}

Json lookUpCodepage(const std::string &asked) {
  const auto number = wholeNumber(asked);
  return number ? lookUpNumber(*number) : lookUpName(asked);
}

std::string descriptionAsText(const Json &description) {
  std::string text = fmt::format("Code page {}\n", description["codepage"].dump());
  const auto line = [&](const char *what, const std::string &value) {
    text += fmt::format("  {:<20} {}\n", what, value);
  };
  const bool opens = description["opens"].get<bool>();
  line("opens", opens ? "yes" : "no: " + description["statusName"].get<std::string>());
  if (opens) {
    line("converter", orNone(description["converter"], "without a name"));
    line("CCSID", orNone(description["ccsid"], "none"));
    line("largest character", description["maxCharSize"].dump() + " byte(s) a UTF-16 unit");
  }
  line("two-null terminator", description["twoNullTerminator"].get<bool>() ? "yes" : "no");
  for (const Json &name : description["windowsNames"]) {
    line("Windows name", name.get<std::string>());
  }
  return text;
}

std::string foundCodepageAsText(const Json &found) {
  std::string text;
  for (const Json &description : found["numbers"]) {
    text += descriptionAsText(description);
  }
  if (found["numbers"].empty()) {
    text += "No number of the library's opens this code page.\n";
  }
  for (const Json &name : found["names"]) {
    text += fmt::format("The name {} opens {}\n", name["name"].get<std::string>(),
                        orNone(name["converter"], "nothing in this ICU"));
  }
  if (found["tablesDiffer"].get<bool>()) {
    text += "Beware: these open different tables.\n";
  }
  return text;
}

} // namespace nls2::tool
