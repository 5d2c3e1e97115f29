// nls2 compare: two strings by the rules of a language.

#include "answer.h"
#include "commands.h"
#include "io/output_file.h"
#include "locale/locale_option.h"
#include "text/string_order.h"

#include <fmt/core.h>
#include <memory>
#include <string>

namespace nls2::tool {

namespace {

constexpr const char *help =
    R"(Prints -1 where A sorts before B, 1 where B sorts before A, 0 where they are equal. The order
counts case, accents and punctuation. A and B are bytes of the code page, at most 32767 each.

Exit codes, as cmp has them: 0 equal, 1 not equal, 2 anything that went wrong. An argument that
begins with a dash goes behind --.)";

struct Arguments {
  LocaleOptions locale;
  bool ignoreTrailing = false;
  std::string a;
  std::string b;
};

void require(StringOrder &order, const char *name, const std::string &text) {
  if (const auto refusal = order.refusal(text)) {
    throw Failure(fmt::format("{}: {}", name, *refusal));
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

void addCompareCommand(CLI::App &app) {
  CLI::App &command =
      *app.add_subcommand("compare", "Compare two strings by the rules of a language");
  const auto arguments = std::make_shared<Arguments>();
  addLocaleOptions(command, arguments->locale);
  command.add_flag("--ignore-trailing", arguments->ignoreTrailing, "trailing blanks do not count");
  command.add_option("A", arguments->a, "the first string")->required();
  command.add_option("B", arguments->b, "the second string")->required();
  command.footer(help);
  command.callback([arguments] { answer([&] { return areEqual(*arguments); }); });
}

} // namespace nls2::tool
