// nls2 find: the lines in which a text occurs.

#include "commands.h"
#include "io/line_reader.h"
#include "io/output_file.h"
#include "locale/locale_option.h"
#include "nls2.h"
#include "text/text_check.h"

#include <fmt/core.h>
#include <memory>
#include <string>
#include <vector>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(PATTERN is plain text in UTF-8, whatever the code page of the files; an empty one occurs in every
line. Lines end in U+000A as the code page writes it, and are printed in the code page.
Exit codes: 0 found, 1 not found, 2 anything that went wrong.
)";

constexpr std::size_t mostBytes = std::size_t{1} << 30;

struct Arguments {
  LocaleOptions locale;
  bool ignoreCase = false;
  bool lineNumbers = false;
  std::string pattern;
  std::vector<std::string> inputs;
};

// A character that the page does not have would be looked for as its substitute.
std::string translatePattern(const std::string &pattern, int32_t page) {
  int32_t status = 0;
  std::string translated = translateText(page, utf8Page, pattern, status);
  if (translateText(utf8Page, page, translated, status) != pattern) {
    throw usageError("PATTERN: not UTF-8, or a character that code page {} does not have", page);
  }
  return translated;
}

class FindRun {
public:
  explicit FindRun(const Arguments &arguments)
      : arguments_(arguments),
        locale_(arguments.locale), format_{lineTerminator(arguments.locale.codepage)},
        pattern_(translatePattern(arguments.pattern, arguments.locale.codepage)),
        check_(arguments.locale.codepage, mostBytes, Nulls::endText) {
    if (search(pattern_) < 0) {
      throw usageError("PATTERN: a character grows in lower case");
    }
  }

  bool run() {
    for (const std::string &path : arguments_.inputs) {
      searchFile(path);
    }
    return found_;
  }

private:
  int32_t search(std::string_view line) const {
    return NLS2_Findstr(locale_.get(), line.data(), static_cast<int32_t>(line.size()),
                        pattern_.data(), static_cast<int32_t>(pattern_.size()),
                        arguments_.ignoreCase ? IGNORECASE : 0);
  }

  void searchFile(const std::string &path) {
    LineReader reader(path, format_);
    for (std::string_view line; reader.next(line);) {
      if (const auto refusal = check_.refusal(line)) {
        reader.fail(*refusal);
      }
      const int32_t answer = search(line);
      if (answer < 0) {
        reader.fail(arguments_.ignoreCase ? "a character grows in lower case, or no memory"
                                          : "no memory");
      }
      if (answer > 0) {
        print(reader, line);
      }
    }
  }

  void print(const LineReader &reader, std::string_view line) {
    std::string prefix = arguments_.inputs.size() > 1 ? reader.name() + ":" : "";
    prefix += arguments_.lineNumbers ? fmt::format("{}:", reader.number()) : "";
    int32_t status = 0;
    std::string text = translateText(arguments_.locale.codepage, utf8Page, prefix, status);
    output_.write(text.append(line).append(format_.terminator));
    found_ = true;
  }

  const Arguments &arguments_;
  const LocaleObject locale_;
  const LineFormat format_;
  const std::string pattern_;
  TextCheck check_;
  OutputFile output_{"-"};
  bool found_ = false;
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
                             .help = "compare both in lower case, by the language's rules",
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
    return FindRun(*arguments).run() ? exitDone : exitFailed;
  };
  return command;
}

} // namespace nls2::tool
