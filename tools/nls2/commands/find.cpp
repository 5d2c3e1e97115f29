// nls2 find: prints the lines in which a text occurs.

#include "base/icu_memory.h"
#include "base/options.h"
#include "io/output_file.h"
#include "locale/locale_option.h"
#include "nls2/text.hpp"
#include "text/decoder.h"
#include "text/record_reader.h"

#include <memory>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(PATTERN is plain text in UTF-8, whatever the code page of the files; an empty one matches every
line. Lines end in the code page's line feed (U+000A) and are printed in the code page. A line with
invalid bytes ends the search of its file; the other files are still searched.
Exit codes: 0 found, 1 not found, 2 error.
)";

struct Arguments {
  LocaleOptions locale;
  bool ignoreCase = false;
  bool lineNumbers = false;
  std::string pattern;
  std::vector<std::string> inputs;
};

// Folds a text that is all ASCII, as most lines are, many units at a time. If it is not, returns
// false and the output is useless.
bool foldAscii(std::u16string_view text, char16_t *folded) {
  char16_t all = 0;
  for (const char16_t unit : text) {
    all |= unit;
    *folded++ = static_cast<char16_t>(unit + (unit >= u'A' && unit <= u'Z' ? 0x20 : 0));
  }
  return all < 0x80;
}

// Checks the pattern as a whole: a page may have a pair of characters but not each of them alone.
void requireCharacters(const std::string &pattern, int32_t page) {
  translator translator(code_page(utf8Page), code_page(page), {});
  std::string encoded;
  const field_result result = translator.translate(pattern, encoded);
  if (result.problem.kind() == problem_kind::not_in_page) {
    throw usageError("PATTERN: the character U+{:04X} is not in code page {}",
                     static_cast<uint32_t>(result.problem.code_point()), page);
  }
}

std::u16string decodedPattern(const std::string &pattern) {
  try {
    return std::u16string(Decoder(utf8Page).decode(pattern));
  } catch (const TextFault &fault) {
    throw usageError("PATTERN{}", fault.what());
  }
}

// Searches lines of a code page for a text.
class TextSearch {
public:
  // Throws usageError if the code page lacks a character of the pattern.
  explicit TextSearch(const Arguments &arguments)
      : decoder_(arguments.locale.codepage),
        encoder_(code_page(utf8Page), code_page(arguments.locale.codepage),
                 {.bad = on_bad::replace}),
        ignoreCase_(arguments.ignoreCase),
        folding_(hasDotlessI(arguments.locale) ? U_FOLD_CASE_EXCLUDE_SPECIAL_I
                                               : U_FOLD_CASE_DEFAULT),
        pattern_(decodedPattern(arguments.pattern)) {
    requireCharacters(arguments.pattern, arguments.locale.codepage);
    if (ignoreCase_) {
      pattern_ = folded(pattern_);
    } else if (decoder_.isUtf8()) {
      utf8Pattern_ = arguments.pattern;
    }
  }

  // Whether the pattern occurs in the line. Throws TextFault.
  bool isIn(std::string_view line) {
    if (!utf8Pattern_.empty() && isAscii(line) && line.find('\0') == line.npos) {
      return line.find(utf8Pattern_) != line.npos;
    }
    const std::u16string_view decoded = withoutNulls(decoder_.decode(line));
    const std::u16string_view text = ignoreCase_ ? folded(decoded) : decoded;
    return u_strFindFirst(text.data(), static_cast<int32_t>(text.size()), pattern_.data(),
                          static_cast<int32_t>(pattern_.size())) != nullptr;
  }

  std::string lineFeed() const { return lineFeedOf(decoder_.page(), true); }

  // Converts UTF-8 to the code page of the lines.
  std::string encode(const std::string &utf8) { return encoder_.translate(utf8); }

private:
  std::u16string_view folded(std::u16string_view text) {
    folded_.resize(std::max(folded_.size(), text.size() + 1));
    if (folding_ == U_FOLD_CASE_DEFAULT && foldAscii(text, folded_.data())) {
      return {folded_.data(), text.size()};
    }
    UErrorCode error = U_ZERO_ERROR;
    const auto length = static_cast<std::size_t>(
        u_strFoldCase(folded_.data(), static_cast<int32_t>(folded_.size()), text.data(),
                      static_cast<int32_t>(text.size()), folding_, &error));
    if (error == U_BUFFER_OVERFLOW_ERROR) {
      folded_.resize(length + 1);
      return folded(text);
    }
    if (U_FAILURE(error)) {
      throw std::bad_alloc();
    }
    return {folded_.data(), length};
  }

  Decoder decoder_;
  translator encoder_;
  const bool ignoreCase_;
  const uint32_t folding_; // U_FOLD_CASE_*
  std::u16string pattern_;
  std::string utf8Pattern_; // if ASCII lines may be searched as bytes; else empty
  std::u16string folded_;   // the last line
};

class FindRun {
public:
  explicit FindRun(const Arguments &arguments)
      : arguments_(arguments), search_(arguments), terminator_(search_.lineFeed()) {}

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
      output_.put(search_.encode(arguments_.lineNumbers ? fmt::format("{}{}:", prefix, line->number)
                                                        : prefix));
      output_.put(line->text);
      output_.put(terminator_);
    }
  }

  std::optional<Record> nextMatch(const std::string &path, std::optional<RecordFile> &file) {
    const auto isMatch = [&](std::string_view text) { return search_.isIn(text); };
    try {
      if (!file) {
        file.emplace(path, RecordShape{.page = arguments_.locale.codepage, .isText = false});
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
  const std::string terminator_;
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
          {flag("ignore-case", "ignore case, by the language's rules", into(arguments->ignoreCase)),
           flag("line-number", "print line numbers", into(arguments->lineNumbers), 'n')}),
      .notes = notes,
      .run = [arguments] { return FindRun(*arguments).run(); }};
}

} // namespace nls2::tool
