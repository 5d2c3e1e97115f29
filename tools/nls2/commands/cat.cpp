// nls2 cat: text files in any encoding as UTF-8 on standard output.

#include "codepage/code_page.h"
#include "io/output_file.h"
#include "io/text_stream.h"
#include "options.h"

#include <algorithm>
#include <memory>
#include <optional>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(NAME is a code page by number, or a converter name of ICU's: UTF-16, ISO-8859-1, ibm-1141. Line ends
and nulls stay what they are. UTF-16 and UTF-32 take off a byte-order mark, and do without one (then
big-endian); with any other name a mark is text, U+FEFF.
Exit codes: 1 if bytes that are not valid in the encoding were replaced, 2 if a file failed.
)";

struct Arguments {
  std::string encoding;
  std::vector<std::string> paths;
};

void reportReplaced(const std::string &name, uint64_t count, const std::string &encoding) {
  const char *verb = count == 1 ? " is" : "s are";
  complain(fmt::format("{}: {} byte sequence{} not valid {}; each was replaced", printable(name),
                       count, verb, printable(encoding))
               .c_str());
}

// The exit code for this file. A failure to read is reported, and leaves the others to be read.
int copy(const Arguments &arguments, const std::string &path, UConverter *converter,
         OutputFile &out) {
  std::optional<TextStream> in;
  int code = exitDone;
  bool isOpen = true;
  while (isOpen) {
    std::string text;
    try {
      if (!in) {
        in.emplace(path, converter);
      }
      text = in->read();
    } catch (const Error &error) {
      complain(error.what());
      code = exitUsage;
    }
    isOpen = !text.empty();
    out.write(text);
  }
  if (in && in->replaced() != 0) {
    reportReplaced(in->name(), in->replaced(), arguments.encoding);
    code = std::max<int>(code, exitFailed);
  }
  return code;
}

int copyAll(const Arguments &arguments) {
  const converter opened = openEncoding("--encoding", arguments.encoding);
  OutputFile out("-");
  int code = exitDone;
  for (const std::string &path : arguments.paths) {
    code = std::max(code, copy(arguments, path, opened.get(), out));
  }
  out.commit();
  return code;
}

} // namespace

Command catCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {
      .operands = {{"FILE", "files to read, one after another; - is standard input",
                    into(arguments->paths), 1, Operand::anyNumber}},
      .options = {required("encoding", "NAME", "the files' encoding", into(arguments->encoding))},
      .notes = notes,
      .run = [arguments] { return copyAll(*arguments); }};
}

} // namespace nls2::tool
