// nls2 cat: a text file in any encoding as UTF-8 on standard output.

#include "commands.h"
#include "errors.h"
#include "io/output_file.h"
#include "io/text_stream.h"

#include <fmt/core.h>
#include <memory>
#include <string>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(NAME is a converter name of ICU's in any spelling: UTF-16, ISO-8859-1, windows-1252, ibm-1141.
Line ends and nulls stay what they are. UTF-16 and UTF-32 take off a byte-order mark, and do without
one (then big-endian); with any other name a mark is text, U+FEFF.
Bytes that are not valid in the encoding are replaced and counted, and the exit code is 1.
)";

struct Arguments {
  std::string encoding;
  std::string path;
};

void copy(const Arguments &arguments) {
  TextStream in(arguments.path, arguments.encoding);
  OutputFile out("-");
  for (std::string text = in.read(); !text.empty(); text = in.read()) {
    out.write(text);
  }
  if (in.badSequences() != 0) {
    throw failure("{}: {} byte sequences are no text of {}; a substitute stands for each",
                  arguments.path, in.badSequences(), arguments.encoding);
  }
}

} // namespace

Command catCommand() {
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {{"FILE", "file to read; - is standard input", into(arguments->path), 1}};
  command.options = {{.name = "encoding",
                      .metavar = "NAME",
                      .help = "the file's encoding",
                      .take = into(arguments->encoding),
                      .isRequired = true}};
  command.notes = notes;
  command.run = [arguments] {
    copy(*arguments);
    return exitDone;
  };
  return command;
}

} // namespace nls2::tool
