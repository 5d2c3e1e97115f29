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

constexpr const char *help =
    R"(NAME is a converter name of ICU's in any spelling: UTF-16, ISO-8859-1, windows-1252, ibm-1141.
FILE may be - for standard input.

Line ends and nulls stay what they are. UTF-16 and UTF-32 take off a byte-order mark and do without
one (then big-endian); with any other name a mark is text, U+FEFF. `nls2 detect` tells which one a
file has.

Bytes that are no text of the encoding are written as U+FFFD or U+001A; their number is told, and
the exit code is 1.)";

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
    throw Failure(
        fmt::format("{}: {} byte sequences are no text of {}; a substitute stands for each",
                    arguments.path, in.badSequences(), arguments.encoding));
  }
}

} // namespace

void addCatCommand(CLI::App &app) {
  CLI::App &command =
      *app.add_subcommand("cat", "Write a text file in any encoding to standard output as UTF-8");
  const auto arguments = std::make_shared<Arguments>();
  command.add_option("--encoding", arguments->encoding, "the file's encoding")
      ->required()
      ->type_name("NAME");
  command.add_option("FILE", arguments->path, "file to read")->required();
  command.footer(help);
  command.callback([arguments] { copy(*arguments); });
}

} // namespace nls2::tool
