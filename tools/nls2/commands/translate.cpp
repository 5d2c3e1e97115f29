// nls2 translate: its options and its help.

#include "commands.h"
#include "convert/translate_run.h"
#include "number_option.h"

#include <limits>
#include <memory>
#include <string>

namespace nls2::tool {

namespace {

constexpr const char *help =
    R"(Each record of N bytes is one field: it is translated for itself.

Padding. Without an option a record is translated as it is, blanks and nulls too. With one of the
three the blanks at its end (tabs and all space characters, and nulls, which count as blanks) are
cut off, and blanks (U+0020) are put back as the option says. The text itself must fit in M bytes.
A record with a null inside its text is refused under these options. So is one whose rest cannot be
filled exactly, such as an odd one with two-byte blanks.

Characters that the destination does not have become its substitution character; that is no failure.
A destination with a signature (57368, 57369, 57372) has it at the start of every record.
The line feed of --newline is U+000A in the destination's own encoding: two bytes in UTF-16, 0x25 in
EBCDIC.

The first record that fails ends the run: standard output then has the records before it; an output
file is not touched, since it takes its name, and the place of an older one, at the end. A last
record shorter than N is such a failure. The input file may be the output file too.)";

struct Arguments {
  TranslateOptions options;
  std::string input = "-";
  std::string output = "-";
};

void addNumbers(CLI::App &command, TranslateOptions &options) {
  constexpr int32_t least = std::numeric_limits<int32_t>::min();
  constexpr int32_t most = std::numeric_limits<int32_t>::max();
  constexpr int32_t longest = 1 << 30;
  addNumber(command, "--from", options.from, least, most, "code page of the input")->required();
  addNumber(command, "--to", options.to, least, most, "code page of the output")->required();
  addNumber(command, "--record-length", options.recordLength, 1, longest,
            "N, the bytes of every input record")
      ->required();
}

void addPadding(CLI::App &command, TranslateOptions &options) {
  CLI::Option *outLength = addNumber(command, "--out-length", options.outLength, 1, 1 << 30,
                                     "M, the most bytes of an output record");
  const auto add = [&](const char *name, Padding padding, const char *description) {
    return command.add_flag_callback(
        name, [&options, padding] { options.padding = padding; }, description);
  };
  CLI::Option *fill = add("--fill", Padding::fill, "pad with blanks to M bytes");
  CLI::Option *keep = add("--keep-blanks", Padding::keepBlanks,
                          "keep as many trailing blanks as there were, or as fit in M");
  CLI::Option *strip = add("--strip", Padding::strip, "drop trailing blanks");
  fill->needs(outLength)->excludes(keep)->excludes(strip);
  keep->excludes(strip);
}

} // namespace

void addTranslateCommand(CLI::App &app) {
  CLI::App &command =
      *app.add_subcommand("translate", "Translate fixed-length records to another code page");
  const auto arguments = std::make_shared<Arguments>();
  addNumbers(command, arguments->options);
  addPadding(command, arguments->options);
  command
      .add_option_function<std::string>(
          "--newline",
          [arguments](const std::string &value) { arguments->options.newline = value == "lf"; },
          "what to put behind every output record: none (default) or lf")
      ->check(CLI::IsMember({"none", "lf"}));
  command.add_option("INPUT", arguments->input, "file to read; standard input if - or not given");
  command.add_option("-o,--output", arguments->output,
                     "file to write; standard output if - or not given");
  command.footer(help);
  command.callback(
      [arguments] { translateFile(arguments->options, arguments->input, arguments->output); });
}

} // namespace nls2::tool
