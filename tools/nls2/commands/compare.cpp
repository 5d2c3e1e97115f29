// nls2 compare: two strings by the rules of a language.

#include "commands.h"
#include "io/output_file.h"
#include "locale/locale_option.h"
#include "text/string_order.h"

#include <fmt/core.h>
#include <memory>
#include <string>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(Prints -1 if A sorts before B, 1 if B sorts before A, 0 if they are equal. The order counts case,
accents and punctuation. A and B are bytes of the code page, at most 32767 each.
Exit codes: 0 equal, 1 not equal, 2 anything that went wrong.
)";

struct Arguments {
  LocaleOptions locale;
  bool ignoreTrailing = false;
  std::string a;
  std::string b;
};

void require(StringOrder &order, const char *name, const std::string &text) {
  if (const auto refusal = order.refusal(text)) {
    throw failure("{}: {}", name, *refusal);
  }
}

bool areEqual(const Arguments &arguments) {
  StringOrder order(arguments.locale, arguments.ignoreTrailing);
  require(order, "A", arguments.a);
  require(order, "B", arguments.b);
  const int32_t result = order.compare(arguments.a, arguments.b);
  OutputFile("-").write(fmt::format("{}\n", result));
  return result == 0;
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
