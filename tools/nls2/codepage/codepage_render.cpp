// Facts about code pages as text and as JSON.

#include "codepage/codepage_render.h"

#include "codepage/page_names.h"
#include "errors.h"
#include "nls2.h"

namespace nls2::tool {

namespace {

// ICU's name of a status, for programs; people get statusText().
std::string statusName(int32_t status) {
  return fmt::format("{} ({})", u_errorName(static_cast<UErrorCode>(status)), status);
}

} // namespace

std::string pageAsText(const PageFacts &facts) {
  std::string text = fmt::format("Code page {}\n", facts.number);
  const auto line = [&](const char *what, const std::string &value) {
    text += fmt::format("  {:<20} {}\n", what, value);
  };
  line("opens", facts.opens ? "yes" : "no: " + statusText(facts.status));
  if (facts.opens) {
    line("converter", facts.converter.value_or("without a name"));
    line("CCSID", facts.ccsid ? fmt::format("{}", *facts.ccsid) : "none");
    line("largest character",
         fmt::format("{} byte(s) a UTF-16 unit", facts.maxCharSize.value_or(0)));
  }
  line("two-null terminator", facts.hasTwoNulls ? "yes" : "no");
  for (const std::string &name : facts.windowsNames) {
    line("Windows name", name);
  }
  return text;
}

std::string foundPagesAsText(const FoundPages &found) {
  std::string text;
  for (const PageFacts &facts : found.numbers) {
    text += pageAsText(facts);
  }
  if (found.numbers.empty()) {
    text += "No number of the library's opens this code page.\n";
  }
  for (const NameFacts &facts : found.names) {
    text += fmt::format("The name {} opens {}\n", facts.name,
                        facts.converter.value_or("nothing in this ICU"));
  }
  return found.tablesDiffer ? text + "Beware: these open different tables.\n" : text;
}

Json pageAsJson(const PageFacts &facts) {
  Json names = Json::array();
  for (const std::string &name : facts.windowsNames) {
    names.append(name);
  }
  Json row = Json::object();
  row.set("codepage", facts.number);
  row.set("opens", facts.opens);
  row.set("converter", facts.converter);
  row.set("ccsid", facts.ccsid);
  row.set("twoNullTerminator", facts.hasTwoNulls);
  row.set("maxCharSize", facts.maxCharSize);
  row.set("windowsNames", std::move(names));
  row.set("status", facts.status);
  row.set("statusName", statusName(facts.status));
  return row;
}

Json foundPagesAsJson(const FoundPages &found) {
  Json numbers = Json::array();
  for (const PageFacts &facts : found.numbers) {
    numbers.append(pageAsJson(facts));
  }
  Json names = Json::array();
  for (const NameFacts &facts : found.names) {
    Json row = Json::object();
    row.set("name", facts.name).set("converter", facts.converter);
    names.append(std::move(row));
  }
  Json result = Json::object();
  result.set("numbers", std::move(numbers)).set("names", std::move(names));
  result.set("tablesDiffer", found.tablesDiffer);
  return result;
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
  for (const CcsidMapEntry *entry = ccsidMap; entry->ccsid != NLS2_CCSID_MAP_END; ++entry) {
    text += fmt::format("{:>6}  {}\n", entry->ccsid, entry->name);
  }
  return text;
}

Json allPagesAsJson() {
  Json names = Json::array();
  for (const CcsidMapEntry *entry = ccsidMap; entry->ccsid != NLS2_CCSID_MAP_END; ++entry) {
    Json row = Json::object();
    row.set("name", entry->name).set("codepage", entry->ccsid);
    names.append(std::move(row));
  }
  Json numbers = Json::array();
  for (const int32_t number : pagesWithNames) {
    numbers.append(pageAsJson(describePage(number)));
  }
  Json result = Json::object();
  result.set("windowsNames", std::move(names)).set("numbers", std::move(numbers));
  return result;
}

} // namespace nls2::tool
