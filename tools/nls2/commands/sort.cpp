// nls2 sort: lines or records in the order of a language.

#include "commands.h"
#include "io/output_file.h"
#include "text/line_order.h"
#include "text/line_reader.h"
#include "text/sorted_lines.h"

#include <memory>
#include <string>
#include <vector>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(The order counts case, accents and punctuation; lines that it holds equal stay in the order of the
input. Lines end in U+000A as the code page writes it; a last line without it gets one. A line whose
bytes are not valid in the code page is an error, and nothing is written then. All lines are held in
memory. OUT may be one of the FILEs.
)";

struct Arguments {
  LocaleOptions locale;
  bool ignoreTrailing = false;
  int32_t recordLength = 0;
  std::vector<std::string> inputs;
  std::string output = "-";
};

void readLines(const std::string &path, const LineFormat &format, LineOrder &order,
               SortedLines &lines) {
  LineReader reader(path, format);
  for (std::string_view line; reader.next(line);) {
    if (const auto fault = order.makeKey(line)) {
      reader.fail(*fault);
    }
    lines.add(line, order.key());
  }
}

void sortFiles(const Arguments &arguments) {
  LineOrder order(arguments.locale, arguments.ignoreTrailing);
  LineFormat format;
  if (arguments.recordLength != 0) {
    format.recordLength = static_cast<std::size_t>(arguments.recordLength);
  } else {
    format.terminator = lineTerminator(arguments.locale.codepage);
  }
  SortedLines lines;
  for (const std::string &path : arguments.inputs) {
    readLines(path, format, order, lines);
  }
  OutputFile output(arguments.output);
  lines.sort();
  lines.forEach([&](std::string_view line) {
    output.put(line);
    output.put(format.terminator);
  });
  output.flush();
  output.commit();
}

} // namespace

Command sortCommand() {
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {{"FILE", "files to read; standard input if - or not given",
                       into(arguments->inputs), 0, Operand::anyNumber}};
  command.options = localeOptions(arguments->locale);
  const auto add = [&](const Option &option) { command.options.push_back(option); };
  add({.name = "ignore-trailing",
       .help = "trailing blanks do not count",
       .take = into(arguments->ignoreTrailing)});
  add({.name = "record-length",
       .metavar = "N",
       .help = "sort records of N bytes instead of lines",
       .take = [arguments](const std::string &text) {
         arguments->recordLength =
             parseNumber("--record-length", text, 1, int32_t{Decoder::mostBytes});
       }});
  add({.name = "output",
       .letter = 'o',
       .metavar = "OUT",
       .help = "file to write; standard output if - or not given",
       .take = into(arguments->output)});
  command.notes = notes;
  command.run = [arguments] {
    if (arguments->inputs.empty()) {
      arguments->inputs.emplace_back("-");
    }
    sortFiles(*arguments);
    return exitDone;
  };
  return command;
}

} // namespace nls2::tool
