// nls2 sort: lines or records in the order of a language.

#include "commands.h"
#include "errors.h"
#include "io/line_reader.h"
#include "io/output_file.h"
#include "text/string_order.h"

#include <algorithm>
#include <future>
#include <memory>
#include <string>
#include <thread>
#include <vector>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(The order counts case, accents and punctuation; lines that it holds equal stay in the order of the
input. Lines end in U+000A as the code page writes it; a last line without it gets one. A line of
more than 32767 bytes, or whose bytes are not valid in the code page, is an error, and nothing is
written then. All lines are held in memory. OUT may be one of the FILEs.
)";

// Below it a thread costs more than it saves.
constexpr std::ptrdiff_t fewLines = 1000;

struct Arguments {
  LocaleOptions locale;
  bool ignoreTrailing = false;
  int32_t recordLength = 0;
  std::vector<std::string> inputs;
  std::string output = "-";
};

using Lines = std::vector<std::string>;

void readLines(const std::string &path, const LineFormat &format, StringOrder &order,
               Lines &lines) {
  LineReader reader(path, format);
  for (std::string_view line; reader.next(line);) {
    if (const auto refusal = order.refusal(line)) {
      reader.fail(*refusal);
    }
    lines.emplace_back(line);
  }
}

// One half in a thread of its own while there are threads to take, then merged. Waits for that half
// also where a comparison throws.
void sortLines(Lines::iterator first, Lines::iterator last, const StringOrder &order,
               unsigned threads) {
  const auto isLess = [&](const std::string &a, const std::string &b) {
    return order.compare(a, b) < 0;
  };
  if (threads < 2 || last - first < fewLines) {
    std::stable_sort(first, last, isLess);
    return;
  }
  const Lines::iterator middle = first + (last - first) / 2;
  std::future<void> firstHalf =
      std::async([=, &order] { sortLines(first, middle, order, threads / 2); });
  sortLines(middle, last, order, threads - threads / 2);
  firstHalf.get();
  std::inplace_merge(first, middle, last, isLess);
}

void sortFiles(const Arguments &arguments) {
  StringOrder order(arguments.locale, arguments.ignoreTrailing);
  LineFormat format;
  if (arguments.recordLength != 0) {
    format.recordLength = static_cast<std::size_t>(arguments.recordLength);
  } else {
    format.terminator = lineTerminator(arguments.locale.codepage);
  }
  Lines lines;
  const Lines standardInput{"-"};
  for (const std::string &path : arguments.inputs.empty() ? standardInput : arguments.inputs) {
    readLines(path, format, order, lines);
  }
  OutputFile output(arguments.output);
  sortLines(lines.begin(), lines.end(), order, std::thread::hardware_concurrency());
  std::string text;
  for (const std::string &line : lines) {
    text.append(line).append(format.terminator);
  }
  output.write(text);
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
         arguments->recordLength = parseNumber("--record-length", text, 1, StringOrder::mostBytes);
       }});
  add({.name = "output",
       .letter = 'o',
       .metavar = "OUT",
       .help = "file to write; standard output if - or not given",
       .take = into(arguments->output)});
  command.notes = notes;
  command.run = [arguments] {
    sortFiles(*arguments);
    return exitDone;
  };
  return command;
}

} // namespace nls2::tool
