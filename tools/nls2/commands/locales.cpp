// nls2 locales: the library's table of locales, or its records of one name or number.

#include "commands.h"
#include "io/print.h"
#include "locale/locale_lookup.h"

#include <memory>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(Language ids are decimal or 0x... A number is looked for among the language ids first. Where several
records are shown, the library's own searches take the first.
)";

struct Arguments {
  std::optional<std::string> asked;
  bool asJson = false;
};

std::string answer(const Arguments &arguments) {
  if (!arguments.asked) {
    const LocaleRecords all = allLocales();
    return arguments.asJson ? localesAsJson(all).text() : localesAsText(all);
  }
  const FoundLocales found = lookUpLocale(*arguments.asked);
  return arguments.asJson ? foundLocalesAsJson(found).text() : foundLocalesAsText(found);
}

} // namespace

Command localesCommand() {
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {{"LOCALE-OR-PAGE",
                       "show the records with this name, language id or code page",
                       [arguments](const std::string &text) { arguments->asked = text; }}};
  command.options = {{.name = "json", .help = "write JSON", .take = into(arguments->asJson)}};
  command.notes = notes;
  command.run = [arguments] {
    print(answer(*arguments));
    return exitDone;
  };
  return command;
}

} // namespace nls2::tool
