// The command line of nls2: the parser over every command's tables, and the list of --fields.

#include "base/options.h"
#include "checks.h"
#include "convert/translate_options.h"

#include <getopt.h>
#include <vector>

namespace {

using fuzz::check;
using namespace nls2::tool;

void fieldList(FuzzedDataProvider &input) {
  TranslateOptions options;
  options.from = 37;
  options.recordLength = input.ConsumeIntegralInRange<size_t>(1, 200);
  options.csv = input.ConsumeBool();
  const std::string list = input.ConsumeRemainingBytesAsString();
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

// Arguments are what lies between line feeds. Nothing is run.
void commandLine(FuzzedDataProvider &input) {
  constexpr Command (*commands[])() = {catCommand,  codepagesCommand, compareCommand,
                                       dumpCommand, detectCommand,    findCommand,
                                       sortCommand, localesCommand,   translateCommand};
  const Command command = input.PickValueInArray(commands)();
  std::vector<std::string> words(1, "nls2");
  std::string text = input.ConsumeRemainingBytesAsString();
  for (size_t at = 0; at < text.size() && words.size() < 30;) {
    const size_t end = std::min(text.find('\n', at), text.size());
    words.push_back(text.substr(at, end - at));
    at = end + 1;
  }
  std::vector<char *> argv;
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
  FuzzedDataProvider input(data, size);
  input.ConsumeBool() ? fieldList(input) : commandLine(input);
  return 0;
}
