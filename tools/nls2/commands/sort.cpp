// nls2 sort: lines or records in the order of a language.

#include "commands.h"
#include "errors.h"
#include "io/line_reader.h"
#include "io/output_file.h"
#include "number_option.h"
#include "text/string_order.h"

#include <algorithm>
#include <future>
#include <memory>
#include <string>
#include <thread>
#include <vector>

namespace nls2::tool {

namespace {

constexpr const char *help =
    R"(Lines end in U+000A as the code page writes it: 0x0A, in EBCDIC 0x25 or 0x15, a code unit of
UTF-16 or UTF-32. A last line without it gets one. With --record-length there are no line ends:
every N bytes are one record.

The order counts case, accents and punctuation; lines that it holds equal stay in the order of the
input. Lines have at most 32767 bytes. A line that is longer, or whose bytes are not text of the
code page, is an error, and so is, under --ignore-trailing, one with text behind a null. Nothing is
written then. OUT may be one of the FILEs, and takes its name at the end.

All lines are held in memory. The language's rules are looked up anew for every comparison, of which
n lines take about n * log2(n): sorting 100,000 lines takes a second or two.)";

// Below it a thread costs more than it saves.
constexpr std::ptrdiff_t fewLines = 1000;

struct Arguments {
  LocaleOptions locale;
  bool ignoreTrailing = false;
  int32_t recordLength = 0;
  std::vector<std::string> inputs{"-"};
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
  for (const std::string &path : arguments.inputs) {
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

void addSortCommand(CLI::App &app) {
  CLI::App &command =
      *app.add_subcommand("sort", "Sort lines or fixed-length records by the rules of a language");
  const auto arguments = std::make_shared<Arguments>();
  addLocaleOptions(command, arguments->locale);
  command.add_flag("--ignore-trailing", arguments->ignoreTrailing, "trailing blanks do not count");
  addNumber(command, "--record-length", arguments->recordLength, 1, StringOrder::mostBytes,
            "N, the bytes of every record");
  command.add_option("FILE", arguments->inputs, "files to read; standard input if - or not given");
  command
      .add_option("-o,--output", arguments->output,
                  "file to write; standard output if - or not given")
      ->type_name("OUT");
  command.footer(help);
  command.callback([arguments] { sortFiles(*arguments); });
}

} // namespace nls2::tool
