// nls2 cat: writes text files in any encoding to standard output as UTF-8.

#include "base/options.h"
#include "codepage/code_page.h"
#include "io/input_file.h"
#include "io/output_file.h"

#include <algorithm>
#include <array>
#include <memory>
#include <optional>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(NAME is a code page number or any name of ICU: UTF-16, ISO-8859-1, ibm-1141. Line ends and nulls are
kept. With UTF-16 and UTF-32 a byte-order mark is removed, and a file without one is read as
big-endian; with any other NAME a mark is text (U+FEFF).
Exit codes: 1 invalid bytes were replaced, 2 error.
)";

struct Arguments {
  std::string encoding;
  std::vector<std::string> paths;
};

// Converts files to UTF-8, one after another.
class Copier {
public:
  explicit Copier(const std::string &encoding) : page_("--encoding", encoding) {}

  int copyAll(const std::vector<std::string> &paths) {
    int code = exitDone;
    for (const std::string &path : paths) {
      code = std::max(code, copy(path));
    }
    out_.commit();
    return code;
  }

private:
  // Returns the exit code for this file. Reports a failure to read and goes on with the next file.
  int copy(const std::string &path) {
    translator_ = openTranslator(page_, CodePage::utf8(), NLS2F_AS_IS, NLS2F_REPLACE);
    replaced_ = 0;
    std::optional<InputFile> in;
    int code = exitDone;
    for (bool isOpen = true; isOpen;) {
      std::size_t length = 0;
      try {
        if (!in) {
          out_.requireOther(in.emplace(path));
        }
        length = in->read(bytes_.data(), bytes_.size());
        isOpen = length > 0;
      } catch (const Error &error) {
        complain(error.what());
        code = exitUsage;
        isOpen = false;
      }
      write({bytes_.data(), length}, !isOpen);
    }
    if (replaced_ != 0) {
      reportReplaced(in->name());
      code = std::max<int>(code, exitFailed);
    }
    return code;
  }

  // Writes the next part of the file in UTF-8.
  void write(std::string_view part, bool isLast) {
    for (bool isDoneWith = false; !isDoneWith;) {
      auto problem = sized<NLS2F_Problem>();
      int64_t read = 0;
      int64_t written = 0;
      int64_t replaced = 0;
      isDoneWith = isDone(NLS2F_TranslateChunk(
          translator_.get(), part.data(), sizeOf(part), isLast ? 1 : 0, utf8_.data(),
          static_cast<int64_t>(utf8_.size()), &read, &written, &replaced, &problem));
      part.remove_prefix(static_cast<std::size_t>(read));
      replaced_ += replaced;
      out_.write({utf8_.data(), static_cast<std::size_t>(written)});
    }
  }

  void reportReplaced(const std::string &name) const {
    const char *verb = replaced_ == 1 ? " is" : "s are";
    complain(fmt::format("{}: {} byte sequence{} not valid in {}; each was replaced", name,
                         replaced_, verb, page_.name())
                 .c_str());
  }

  const CodePage page_;
  Translator translator_;
  int64_t replaced_ = 0; // byte sequences and lone surrogates of the file
  std::array<char, std::size_t{64} * 1024> bytes_;
  std::array<char, std::size_t{64} * 1024> utf8_;
  OutputFile out_{"-"};
};

} // namespace

Command catCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {.operands = {{"FILE", "input files, written one after another; - is standard input",
                        into(arguments->paths), 1, Operand::anyNumber}},
          .options = {required(
              value("encoding", "NAME", "encoding of the files", into(arguments->encoding)))},
          .notes = notes,
          .run = [arguments] { return Copier(arguments->encoding).copyAll(arguments->paths); }};
}

} // namespace nls2::tool
