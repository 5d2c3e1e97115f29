// The command line of nls2: the parser over every command's tables, and the list of --fields.

#include "base/options.h"
#include "convert/translate_options.h"
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

void fieldList(property::Input &input) {
  TranslateOptions options;
  options.from = 37;
  options.recordLength = 1 + input.below(200);
  options.csv = input.flag();
  const std::string list =
      line(input, {"1-", "1-10", "11-", "200", ",", "=", "hex", "=raw", ":", "5", "930"});
  try {
    const std::vector<FieldSpec> fields = parseFields(list, options);
    check(!fields.empty(), "a list that parses has a field");
    for (const FieldSpec &field : fields) {
      check(field.begin < field.end && field.end <= options.recordLength,
            "a field lies in the record");
      check(!options.csv || field.kind != FieldSpec::Kind::raw, "no raw bytes in CSV");
    }
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
  std::string text =
      line(input, {"--from\n37\n", "--to\n", "1208\n", "--record-length\n80\n", "--fields=1-10\n",
                   "--str", "ip\n", "-o\n", "x\n", "--locale=de_DE\n", "-", "=", "--help\n"});
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
  input.flag() ? fieldList(input) : commandLine(input);
  return 0;
}
