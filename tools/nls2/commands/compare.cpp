// nls2 compare: two strings by the rules of a language.

#include "commands.h"
#include "io/output_file.h"
#include "locale/locale_option.h"
#include "text/line_order.h"

#include <fmt/core.h>
#include <memory>
#include <string>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(Prints -1 if A sorts before B, 1 if B sorts before A, 0 if they are equal. The order counts case,
accents and punctuation. A and B are bytes of the code page.
Exit codes: 0 equal, 1 not equal, 2 anything that went wrong.
)";

struct Arguments {
  LocaleOptions locale;
  bool ignoreTrailing = false;
  std::string a;
  std::string b;
};

std::string keyOf(LineOrder &order, const char *name, const std::string &text) {
  if (const auto fault = order.makeKey(text)) {
    throw failure("{}", describe(name, *fault));
  }
  return std::string(order.key());
}

bool areEqual(const Arguments &arguments) {
  LineOrder order(arguments.locale, arguments.ignoreTrailing);
  const std::string a = keyOf(order, "A", arguments.a);
  const std::string b = keyOf(order, "B", arguments.b);
  OutputFile("-").write(a < b ? "-1\n" : a > b ? "1\n" : "0\n");
  return a == b;
}

} // namespace

Command compareCommand() {
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {{"A", "the first string", into(arguments->a), 1},
                      {"B", "the second string", into(arguments->b), 1}};
  command.options = localeOptions(arguments->locale);
  command.options.push_back({.name = "ignore-trailing",
                             .help = "trailing blanks do not count",
                             .take = into(arguments->ignoreTrailing)});
  command.notes = notes;
  command.run = [arguments] { return areEqual(*arguments) ? exitDone : exitFailed; };
  return command;
}

} // namespace nls2::tool
