// nls2 compare: compares two texts by the rules of a language.

#include "base/options.h"
#include "io/output_file.h"
#include "text/text_order.h"

#include <memory>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(Prints -1 if A sorts before B, 1 if B sorts before A, 0 if they are equal. Case, accents and
punctuation count. A and B are read in the code page.
Exit codes: 0 equal, 1 not equal, 2 error.
)";

struct Arguments {
  OrderOptions order;
  std::string a, b;
};

int compare(const Arguments &arguments) {
  TextOrder order(arguments.order, arguments.order.locale.codepage);
  const auto keyOf = [&](const char *name, const std::string &text) {
    try {
      return std::string(order.keyOf(text));
    } catch (const TextFault &fault) {
      throw failure("{}{}", name, fault.what());
    }
  };
  const std::string a = keyOf("A", arguments.a);
  const std::string b = keyOf("B", arguments.b);
  print(a < b ? "-1\n" : a > b ? "1\n" : "0\n");
  return a == b ? exitDone : exitFailed;
}

} // namespace

Command compareCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {.operands = {{"A", "the first string", into(arguments->a), 1},
                       {"B", "the second string", into(arguments->b), 1}},
          .options = orderOptions(arguments->order),
          .notes = notes,
          .run = [arguments] { return compare(*arguments); }};
}

} // namespace nls2::tool
