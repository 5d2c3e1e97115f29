// nls2 find: the lines in which a text occurs.

#include "commands.h"
#include "errors.h"
#include "io/output_file.h"
#include "locale/locale_option.h"
#include "text/line_reader.h"
#include "text/text_search.h"

#include <memory>
#include <string>
#include <vector>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(PATTERN is plain text in UTF-8, whatever the code page of the files; an empty one occurs in every
line. Lines end in U+000A as the code page writes it, and are printed in the code page. A line whose
bytes are not valid in the code page ends the search of its file; the other files are searched.
Exit codes: 0 found, 1 not found, 2 anything that went wrong.
)";

struct Arguments {
  LocaleOptions locale;
  bool ignoreCase = false;
  bool lineNumbers = false;
  std::string pattern;
  std::vector<std::string> inputs;
};

class FindRun {
public:
  explicit FindRun(const Arguments &arguments)
      : arguments_(arguments), search_(arguments.locale, arguments.pattern, arguments.ignoreCase),
        format_{lineTerminator(arguments.locale.codepage)} {}

  // A file that fails does not keep the others from being searched. Output that fails ends the run.
  int run() {
    for (const std::string &path : arguments_.inputs) {
      try {
        searchFile(path);
      } catch (const Error &error) {
        if (isPrinting_) {
          throw;
        }
        flush();
        complain(error.what());
        failed_ = true;
      }
    }
    flush();
    return failed_ ? exitUsage : found_ ? exitDone : exitFailed;
  }

private:
  void searchFile(const std::string &path) {
    LineReader reader(path, format_);
    const std::string name =
        arguments_.inputs.size() == 1 ? "" : (path == "-" ? "standard input" : path) + ":";
    for (std::string_view line; reader.next(line);) {
      bool found = false;
      if (const auto fault = search_.search(line, found)) {
        reader.fail(*fault);
      }
      if (found) {
        print(arguments_.lineNumbers ? fmt::format("{}{}:", name, reader.number()) : name, line);
      }
    }
  }

  void print(const std::string &prefix, std::string_view line) {
    isPrinting_ = true;
    if (!prefix.empty()) {
      output_.put(search_.decoder().encode(prefix));
    }
    output_.put(line);
    output_.put(format_.terminator);
    isPrinting_ = false;
    found_ = true;
  }

  void flush() {
    isPrinting_ = true;
    output_.flush();
    isPrinting_ = false;
  }

  const Arguments &arguments_;
  TextSearch search_;
  const LineFormat format_;
  OutputFile output_{"-"};
  bool isPrinting_ = false;
  bool found_ = false;
  bool failed_ = false;
};

} // namespace

Command findCommand() {
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {{"PATTERN", "the text to find", into(arguments->pattern), 1},
                      {"FILE", "files to read; standard input if - or not given",
                       into(arguments->inputs), 0, Operand::anyNumber}};
  command.options = localeOptions(arguments->locale);
  command.options.push_back({.name = "ignore-case",
                             .help = "fold the case of both, by the language's rules",
                             .take = into(arguments->ignoreCase)});
  command.options.push_back({.name = "line-number",
                             .letter = 'n',
                             .help = "print the lines' numbers",
                             .take = into(arguments->lineNumbers)});
  command.notes = notes;
  command.run = [arguments] {
    if (arguments->inputs.empty()) {
      arguments->inputs.emplace_back("-");
    }
    return FindRun(*arguments).run();
  };
  return command;
}

} // namespace nls2::tool
