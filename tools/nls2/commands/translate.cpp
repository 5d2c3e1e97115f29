// nls2 translate: its options and its help.

#include "commands.h"
#include "convert/translate_run.h"

#include <memory>
#include <string>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(Each record is one field and is translated on its own. Under --fill, --keep-blanks and --strip the
blanks and nulls at its end are cut off, and blanks (U+0020) are put back as the option says; a null
inside the text is refused. A character that the output lacks becomes its substitution character.
The first record that fails ends the run; an output file appears only when it is complete.
)";

struct Arguments {
  TranslateOptions options;
  std::string input = "-";
  std::string output = "-";
};

constexpr int32_t longest = 1 << 30;

// At most one of the three, whichever comes first on the command line.
void choose(Padding &padding, Padding chosen) {
  if (padding != Padding::none && padding != chosen) {
    throw usageError("--fill, --keep-blanks and --strip exclude each other");
  }
  padding = chosen;
}

bool isLineFeed(const std::string &text) {
  if (text != "none" && text != "lf") {
    throw usageError("--newline: \"{}\" is not none or lf", printable(text));
  }
  return text == "lf";
}

int run(const Arguments &arguments) {
  if (arguments.options.padding == Padding::fill && arguments.options.outLength == 0) {
    throw usageError("--fill needs --out-length");
  }
  translateFile(arguments.options, arguments.input, arguments.output);
  return exitDone;
}

} // namespace

Command translateCommand() {
  const auto arguments = std::make_shared<Arguments>();
  TranslateOptions &options = arguments->options;
  Command command;
  command.operands = {{.metavar = "INPUT",
                       .help = "file to read; standard input if - or not given",
                       .take = into(arguments->input)}};
  command.options = {
      {.name = "from",
       .metavar = "PAGE",
       .help = "code page of the input",
       .take = [&](const std::string &text) { options.from = parsePage("--from", text); },
       .isRequired = true},
      {.name = "to",
       .metavar = "PAGE",
       .help = "code page of the output",
       .take = [&](const std::string &text) { options.to = parsePage("--to", text); },
       .isRequired = true},
      {.name = "record-length",
       .metavar = "N",
       .help = "bytes of every input record",
       .take =
           [&](const std::string &text) {
             options.recordLength = parseNumber("--record-length", text, 1, longest);
           },
       .isRequired = true},
      {.name = "out-length",
       .metavar = "M",
       .help = "the most bytes of an output record",
       .take =
           [&](const std::string &text) {
             options.outLength = parseNumber("--out-length", text, 1, longest);
           }},
      {.name = "fill",
       .help = "pad with blanks to M bytes",
       .take = [&](const std::string &) { choose(options.padding, Padding::fill); }},
      {.name = "keep-blanks",
       .help = "keep the trailing blanks, or as many as fit in M",
       .take = [&](const std::string &) { choose(options.padding, Padding::keepBlanks); }},
      {.name = "strip",
       .help = "drop trailing blanks",
       .take = [&](const std::string &) { choose(options.padding, Padding::strip); }},
      {.name = "newline",
       .metavar = "KIND",
       .help = "what ends every output record: none (default) or lf",
       .take = [&](const std::string &text) { options.newline = isLineFeed(text); }},
      {.name = "output",
       .letter = 'o',
       .metavar = "OUT",
       .help = "file to write; standard output if - or not given",
       .take = into(arguments->output)}};
  command.notes = notes;
  command.run = [arguments] { return run(*arguments); };
  return command;
}

} // namespace nls2::tool
