// nls2 dump: a file in hex and, side by side, as text of a code page.

#include "codepage/page_dump.h"
#include "commands.h"
#include "io/input_file.h"
#include "io/output_file.h"

#include <algorithm>
#include <memory>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(A character stands where its first byte does, and takes as many columns as it has bytes. What does
not print, shifts and bytes that are not valid are dots. Records begin a new line and are decoded on
their own. The last line is the offset of the end.
)";

constexpr std::size_t chunkBytes = std::size_t{64} * 1024;

struct Arguments {
  std::string path = "-";
  int32_t page = 0;
  std::size_t recordLength = 0; // 0: the whole file is one record
};

int dump(const Arguments &arguments) {
  PageDump dump(CodePage(arguments.page, "--from"));
  InputFile in(arguments.path);
  OutputFile out("-");
  std::string bytes(chunkBytes, '\0');
  std::size_t left = arguments.recordLength; // of the record
  for (std::size_t got = 0; (got = in.read(bytes.data(), bytes.size(), -1)) > 0;) {
    std::string text;
    for (std::string_view rest(bytes.data(), got); !rest.empty();) {
      const std::size_t length = left != 0 ? std::min(left, rest.size()) : rest.size();
      dump.add(rest.substr(0, length), text);
      rest.remove_prefix(length);
      left -= left != 0 ? length : 0;
      if (left == 0 && arguments.recordLength != 0) {
        dump.endRecord(text);
        left = arguments.recordLength;
      }
    }
    out.write(text);
  }
  std::string text;
  dump.endRecord(text);
  dump.end(text);
  out.write(text);
  out.commit();
  return exitDone;
}

} // namespace

Command dumpCommand() {
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {
      {"FILE", "file to read; standard input if - or not given", into(arguments->path)}};
  command.options = {
      {.name = "from",
       .metavar = "PAGE",
       .help = "code page of the file",
       .take =
           [arguments](const std::string &text) { arguments->page = parsePage("--from", text); },
       .isRequired = true},
      {.name = "record-length",
       .metavar = "N",
       .help = "bytes of every record",
       .take = [arguments](const std::string &text) {
         arguments->recordLength =
             static_cast<std::size_t>(parseNumber("--record-length", text, 1, 1 << 30));
       }}};
  command.notes = notes;
  command.run = [arguments] { return dump(*arguments); };
  return command;
}

} // namespace nls2::tool
