// nls2 find: prints the lines in which a text occurs.

#include "base/icu_memory.h"
#include "base/options.h"
#include "io/output_file.h"
#include "text/record_source.h"
#include "text/text_order.h"

#include <memory>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(PATTERN is plain text in UTF-8, whatever the code page of the files; an empty one matches every
line. FORMAT is lines (the default: LF, CR LF and NEL end them) or fixed:N. Lines are printed as they
are, in the code page. A line with invalid bytes ends the search of its file; the other files are
still searched.
Exit codes: 0 found, 1 not found, 2 error.
)";

struct Arguments {
  LocaleOptions locale;
  bool ignoreCase = false;
  bool lineNumbers = false;
  std::string format = "lines";
  std::string pattern;
  std::vector<std::string> inputs;
};

// Searches lines of a code page for a text.
class TextSearch {
public:
  // Throws usageError if the code page lacks a character of the pattern.
  explicit TextSearch(const Arguments &arguments)
      : page_(arguments.locale.codepage), text_(page_),
        encoder_(openTranslator(CodePage::utf8(), page_, NLS2F_AS_IS, NLS2F_REPLACE_VISIBLY)),
        collator_(openCollator(caseLocale(arguments.locale), page_,
                               arguments.ignoreCase ? IGNORECASE : 0)) {
    const Translator strict = openTranslator(CodePage::utf8(), page_, NLS2F_AS_IS);
    auto problem = sized<NLS2F_Problem>();
    if (!translateText(strict.get(), arguments.pattern, pattern_, problem)) {
      throw usageError("PATTERN, column {}: {}", problem.offset + 1,
                       wordsOf(problem, strict.get()));
    }
  }

  // Whether the pattern occurs in the line. Throws TextFault.
  bool isIn(std::string_view line) {
    text_.utf8(line);
    int64_t position = -1;
    int64_t length = 0;
    isDone(NLS2F_Find(collator_.get(), line.data(), sizeOf(line), pattern_.data(), sizeOf(pattern_),
                      &position, &length));
    return position >= 0;
  }

  // Converts UTF-8 to the code page of the lines.
  std::string encode(const std::string &utf8) {
    std::string bytes;
    auto problem = sized<NLS2F_Problem>();
    translateText(encoder_.get(), utf8, bytes, problem);
    return bytes;
  }

private:
  const CodePage page_;
  ValidText text_;
  Translator encoder_;
  Collator collator_;
  std::string pattern_;
};

class FindRun {
public:
  explicit FindRun(const Arguments &arguments)
      : arguments_(arguments), search_(arguments),
        end_(lineEnd(arguments.format, arguments.locale.codepage)) {}

  int run() {
    for (const std::string &path : inputsOf(arguments_.inputs)) {
      searchFile(path);
    }
    output_.commit();
    return failed_ ? exitUsage : found_ ? exitDone : exitFailed;
  }

private:
  // A file that cannot be read does not stop the search of the others; a failed write does.
  void searchFile(const std::string &path) {
    const std::string name = (path == "-" ? "standard input" : path) + ":";
    const std::string prefix = arguments_.inputs.size() > 1 ? name : "";
    std::optional<RecordFile> file;
    while (const auto line = nextMatch(path, file)) {
      found_ = true;
      end_ = line->end.empty() ? end_ : line->end;
      output_.put(search_.encode(arguments_.lineNumbers ? fmt::format("{}{}:", prefix, line->number)
                                                        : prefix));
      output_.put(line->text);
      output_.put(end_);
    }
  }

  std::optional<Record> nextMatch(const std::string &path, std::optional<RecordFile> &file) {
    const auto isMatch = [&](std::string_view text) { return search_.isIn(text); };
    try {
      if (!file) {
        file.emplace(path,
                     RecordShape{.format = arguments_.format, .page = arguments_.locale.codepage});
        output_.requireOther(file->input());
      }
      auto line = file->next();
      while (line && !file->apply(*line, isMatch)) {
        line = file->next();
      }
      return line;
    } catch (const Error &error) {
      requireMemory(); // if memory ran out, the text may be valid after all
      output_.flush();
      complain(error.what());
      failed_ = true;
      return {};
    }
  }

  const Arguments &arguments_;
  TextSearch search_;
  std::string end_; // of the last line that had one
  OutputFile output_{"-"};
  bool found_ = false;
  bool failed_ = false;
};

} // namespace

Command findCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {
      .operands = {{"PATTERN", "text to find", into(arguments->pattern), 1},
                   {"FILE", "input files; standard input if - or not given",
                    into(arguments->inputs), 0, Operand::anyNumber}},
      .options = localeOptions(
          arguments->locale,
          {linesOrFixed(arguments->format),
           flag("ignore-case", "ignore case, by the language's rules", into(arguments->ignoreCase)),
           flag("line-number", "print line numbers", into(arguments->lineNumbers), 'n')}),
      .notes = notes,
      .run = [arguments] { return FindRun(*arguments).run(); }};
}

} // namespace nls2::tool
