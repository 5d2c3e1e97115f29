// nls2 codepages: the library's numbers and names of code pages, what is known of one, its chart,
// and where two differ.

#include "codepage/byte_chart.h"
#include "codepage/codepage_render.h"
#include "codepage/page_names.h"
#include "commands.h"
#include "io/print.h"

#include <memory>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(A number is the library's; everything else is a name as ICU spells them: cp037, latin1. Without PAGE
all numbers with names and all Windows names are listed. In a chart, rows are the first hex digit of
a byte and columns the second.
)";

struct Arguments {
  std::vector<std::string> pages;
  bool asChart = false;
  bool asDifference = false;
  bool asNames = false;
  bool asJson = false;
};

template <class Text, class AsJson>
std::string rendered(const Arguments &arguments, Text asText, AsJson asJson) {
  return arguments.asJson ? asJson().text() : asText();
}

ByteChart chartOf(const char *option, const std::string &page) {
  return tool::chartOf(CodePage(parsePage(option, page), option));
}

std::string difference(const Arguments &arguments) {
  if (arguments.pages.size() != 2) {
    throw usageError("--diff needs two PAGEs");
  }
  const ByteChart a = chartOf("--diff", arguments.pages[0]);
  const ByteChart b = chartOf("--diff", arguments.pages[1]);
  return rendered(
      arguments, [&] { return differenceAsText(a, b); }, [&] { return differenceAsJson(a, b); });
}

std::string namesAsText() {
  std::string text;
  for (const std::string &name : namesWithNumbers()) {
    text += name + "\n";
  }
  return text;
}

Json namesAsJson() {
  Json names = Json::array();
  for (const std::string &name : namesWithNumbers()) {
    names.append(name);
  }
  return names;
}

std::string answer(const Arguments &arguments) {
  if (arguments.asChart + arguments.asDifference + arguments.asNames > 1) {
    throw usageError("--chart, --diff and --names exclude each other");
  }
  if (arguments.asDifference) {
    return difference(arguments);
  }
  const std::size_t most = arguments.asNames ? 0 : 1;
  if (arguments.pages.size() > most) {
    throw usageError("extra operand {}", printable(arguments.pages[most]));
  }
  if (arguments.asNames) {
    return rendered(arguments, namesAsText, namesAsJson);
  }
  if (arguments.asChart) {
    if (arguments.pages.empty()) {
      throw usageError("--chart needs a PAGE");
    }
    const ByteChart chart = chartOf("--chart", arguments.pages[0]);
    return rendered(
        arguments, [&] { return chartAsText(chart); }, [&] { return chartAsJson(chart); });
  }
  if (arguments.pages.empty()) {
    return rendered(arguments, allPagesAsText, allPagesAsJson);
  }
  const FoundPages found = lookUpPage(arguments.pages[0]);
  return rendered(
      arguments, [&] { return foundPagesAsText(found); }, [&] { return foundPagesAsJson(found); });
}

} // namespace

Command codepagesCommand() {
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {{"PAGE", "show what the library and ICU make of this number or name",
                       into(arguments->pages), 0, 2}};
  command.options = {{.name = "chart",
                      .help = "show what every byte of PAGE means",
                      .take = into(arguments->asChart)},
                     {.name = "diff",
                      .help = "show the bytes whose characters differ in two PAGEs",
                      .take = into(arguments->asDifference)},
                     {.name = "names",
                      .help = "list the names that options take for a PAGE",
                      .take = into(arguments->asNames)},
                     {.name = "json", .help = "write JSON", .take = into(arguments->asJson)}};
  command.notes = notes;
  command.run = [arguments] {
    print(answer(*arguments));
    return exitDone;
  };
  return command;
}

} // namespace nls2::tool
