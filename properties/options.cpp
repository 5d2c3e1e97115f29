// The command line of nls2: the parser over every command's tables, and the plan of a translation.

#include "base/options.h"
#include "convert/plan.h"
#include "property.h"

#include <getopt.h>
#include <vector>

namespace {

using property::check;
using namespace nls2::tool;

// Any bytes, or words that the command knows.
std::string line(property::Input &input, const std::vector<const char *> &pieces) {
  if (input.flag()) {
    return input.bytes(SIZE_MAX);
  }
  std::string text;
  for (size_t count = input.below(20); count > 0; --count) {
    text += input.oneOf(pieces);
  }
  return text;
}

// Formats and fields make a plan, or a message.
void plan(property::Input &input) {
  const auto format = [&] {
    return line(input, {"fixed:", "80", "lines", "prefixed", ":data", "csv", ":crlf", "joined"});
  };
  TranslateOptions options;
  try {
    options.read = format();
    options.write = format();
    if (input.flag()) {
      options.from = CodePage("", input.flag() ? "37" : "utf-16");
      options.to = CodePage("", input.flag() ? "930" : "1200");
    }
    if (input.flag()) {
      options.fields = line(input, {"1-", "1-10", "11-", "=", "hex", ";", "packed.2", "page:37"});
    }
    options.keepsBlanks = input.flag();
    const Plan made(options);
    check(!made.fields.empty(), "a plan has a field");
    for (const FieldPlan &field : made.fields) {
      const int64_t end = field.field.first + field.field.length;
      check(made.readLength == 0 || end <= made.readLength, "a field lies in the record");
      check(!field.isNumber() || made.readsCsv != made.writesCsv, "numbers are text in CSV");
    }
    check(emptyRecord(made).empty() || made.fillsLayout(), "only a layout is filled");
  } catch (const Error &refused) {
    check(refused.code() == exitUsage && refused.what()[0] != '\0', "a usage error with a message");
  }
}

// Line feeds separate arguments. No command runs.
void commandLine(property::Input &input) {
  constexpr Command (*commands[])() = {catCommand,  codepagesCommand, compareCommand,
                                       dumpCommand, detectCommand,    findCommand,
                                       sortCommand, localesCommand,   translateCommand};
  const Command command = input.oneOf(commands)();
  std::vector<std::string> words(1, "nls2");
  std::string text = line(input, {"--from\n37\n", "--to\n", "1208\n", "--read\nfixed:80\n",
                                  "--fields=1-10\n", "--blan", "ks\nkeep\n", "-o\n", "x\n",
                                  "--locale=de_DE\n", "-", "=", "--help\n"});
  for (size_t at = 0; at < text.size() && words.size() < 30;) {
    const size_t end = std::min(text.find('\n', at), text.size());
    words.push_back(text.substr(at, end - at));
    at = end + 1;
  }
  std::vector<char *> argv;
  argv.reserve(words.size() + 1);
  for (std::string &word : words) {
    argv.push_back(word.data());
  }
  argv.push_back(nullptr);
  optind = 0;
  try {
    parse(command, static_cast<int>(words.size()), argv.data());
  } catch (const Error &refused) {
    check(refused.code() != 0 && refused.what()[0] != '\0', "an error with a message");
  }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  property::Input input(data, size);
  input.flag() ? plan(input) : commandLine(input);
  return 0;
}
