// nls2 cat: writes text files in any encoding to standard output as UTF-8.

#include "base/options.h"
#include "codepage/code_page.h"
#include "io/input_file.h"
#include "io/output_file.h"

#include <algorithm>
#include <array>
#include <memory>
#include <optional>
#include <unicode/ucnv.h>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(NAME is a code page number or the name of a converter of ICU: UTF-16, ISO-8859-1, ibm-1141. Line ends
and nulls are kept. With UTF-16 and UTF-32 a byte-order mark is removed, and a file without one is
read as big-endian; with any other NAME a mark is text (U+FEFF).
Exit codes: 1 invalid bytes were replaced, 2 error.
)";

struct Arguments {
  std::string encoding;
  std::vector<std::string> paths;
};

// Converts files to UTF-8, one after another.
class Copier {
public:
  explicit Copier(const std::string &encoding)
      : encoding_(encoding), source_(openEncoding("--encoding", encoding)),
        utf8_(CodePage(utf8Page, "UTF-8").take()) {
    UErrorCode error = U_ZERO_ERROR;
    ucnv_setToUCallBack(source_.get(), onInvalid, &replaced_, nullptr, nullptr, &error);
    ucnv_setFromUCallBack(utf8_.get(), onLoneSurrogate, &replaced_, nullptr, nullptr, &error);
    requireSuccess(error, "convert to UTF-8");
  }
  Copier(const Copier &) = delete; // the converters hold pointers to it
  Copier &operator=(const Copier &) = delete;

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
    ucnv_reset(source_.get());
    ucnv_reset(utf8_.get());
    pivotSource_ = pivotTarget_ = pivot_.data();
    replaced_ = 0;
    std::optional<InputFile> in;
    int code = exitDone;
    for (bool isOpen = true; isOpen;) {
      std::string text;
      try {
        if (!in) {
          out_.requireOther(in.emplace(path));
        }
        isOpen = read(*in, text);
      } catch (const Error &error) {
        complain(error.what());
        code = exitUsage;
        isOpen = false;
      }
      out_.write(text);
    }
    if (replaced_ != 0) {
      reportReplaced(in->name());
      code = std::max<int>(code, exitFailed);
    }
    return code;
  }

  static void onInvalid(const void *counter, UConverterToUnicodeArgs *arguments, const char *bytes,
                        int32_t length, UConverterCallbackReason reason, UErrorCode *error) {
    count(counter, reason);
    UCNV_TO_U_CALLBACK_SUBSTITUTE(nullptr, arguments, bytes, length, reason, error);
  }

  // UTF-8 cannot represent lone surrogates.
  static void onLoneSurrogate(const void *counter, UConverterFromUnicodeArgs *arguments,
                              const UChar *units, int32_t length, UChar32 character,
                              UConverterCallbackReason reason, UErrorCode *error) {
    count(counter, reason);
    UCNV_FROM_U_CALLBACK_SUBSTITUTE(nullptr, arguments, units, length, character, reason, error);
  }

  static void count(const void *counter, UConverterCallbackReason reason) {
    *static_cast<uint64_t *>(const_cast<void *>(counter)) += reason <= UCNV_IRREGULAR ? 1 : 0;
  }

  // Appends the next part of the file. False at its end.
  bool read(InputFile &in, std::string &text) {
    const std::size_t length = in.read(bytes_.data(), bytes_.size());
    const char *source = bytes_.data();
    UErrorCode error = U_BUFFER_OVERFLOW_ERROR;
    while (error == U_BUFFER_OVERFLOW_ERROR) {
      error = U_ZERO_ERROR;
      char *target = utf8Bytes_.data();
      ucnv_convertEx(utf8_.get(), source_.get(), &target, target + utf8Bytes_.size(), &source,
                     bytes_.data() + length, pivot_.data(), &pivotSource_, &pivotTarget_,
                     pivot_.data() + pivot_.size(), false, static_cast<UBool>(length == 0), &error);
      text.append(utf8Bytes_.data(), target);
    }
    requireSuccess(error, "convert to UTF-8");
    return length > 0;
  }

  void reportReplaced(const std::string &name) const {
    const char *verb = replaced_ == 1 ? " is" : "s are";
    complain(fmt::format("{}: {} byte sequence{} not valid {}; each was replaced", name, replaced_,
                         verb, printable(encoding_))
                 .c_str());
  }

  const std::string encoding_;
  const Converter source_, utf8_;
  uint64_t replaced_ = 0; // byte sequences and lone surrogates of the file
  std::array<char, std::size_t{64} * 1024> bytes_;
  std::array<char, std::size_t{64} * 1024> utf8Bytes_;
  std::array<UChar, std::size_t{16} * 1024> pivot_; // text between the two converters
  UChar *pivotSource_ = nullptr;
  UChar *pivotTarget_ = nullptr;
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
