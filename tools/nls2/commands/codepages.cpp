// nls2 codepages: the library's numbers and names of code pages, or what is known of one.

#include "codepage/codepage_render.h"
#include "commands.h"
#include "io/print.h"

#include <memory>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(A number is the library's; everything else is a name as ICU spells them: cp037, latin1, windows-1252.
)";

struct Arguments {
  std::optional<std::string> asked;
  bool asJson = false;
};

std::string answer(const Arguments &arguments) {
  if (!arguments.asked) {
    return arguments.asJson ? allPagesAsJson().text() : allPagesAsText();
  }
  const FoundPages found = lookUpPage(*arguments.asked);
  return arguments.asJson ? foundPagesAsJson(found).text() : foundPagesAsText(found);
}

} // namespace

Command codepagesCommand() {
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {{"PAGE", "show what the library and ICU make of this number or name",
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
