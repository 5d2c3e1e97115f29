// The readers of records and lines: all bytes of a file come back, in order, divided correctly.

#include "base/errors.h"
#include "property.h"
#include "text/record_source.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <unistd.h>

namespace {

using property::check;
using namespace nls2::tool;

// A file in memory, with a path that opens it.
class File {
public:
  explicit File(const std::string &bytes) : fd_(memfd_create("property", 0)) {
    check(write(fd_, bytes.data(), bytes.size()) == static_cast<ssize_t>(bytes.size()), "a file");
  }
  ~File() { close(fd_); }
  File(const File &) = delete;
  File &operator=(const File &) = delete;

  std::string path() const { return "/proc/self/fd/" + std::to_string(fd_); }

private:
  int fd_;
};

// The wanted records of a file, with all that belongs to them, after what is before the first.
std::string readAll(const RecordShape &shape, const File &file) {
  InputFile input(file.path());
  RecordSource source(input, shape);
  RecordPiece piece;
  std::string read;
  uint64_t number = shape.skip;
  for (bool isFirst = true; source.read(piece); isFirst = false) {
    if (piece.problem) {
      check(shape.skip != 0 || piece.number == number + 1, "a problem knows its record");
      return read.append(piece.bytes.bytes());
    }
    read += isFirst && shape.skip == 0 ? source.preamble() : "";
    check(!piece.records.empty() && piece.number == number + 1, "records are counted");
    for (size_t i = 0; i < piece.records.size(); ++i) {
      check(shape.skip != 0 || piece.offsetOf(i) == read.size(), "a record knows its place");
      check(piece.wholeOf(i).find(piece.text(i)) != std::string_view::npos, "its text is in it");
      read += piece.wholeOf(i);
    }
    number += piece.records.size();
  }
  return read;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  property::Input input(data, size);
  const property::Page page = input.page();
  const char *const formats[] = {"lines", "lines:lf", "fixed:1", "fixed:7", "prefixed", "csv"};
  try {
    RecordShape shape{.format = input.oneOf(formats),
                      .page = CodePage("", std::to_string(page.number))};
    shape.mostInPiece = 1 + input.below(4);
    const uint64_t skip = input.below(4);
    const std::string bytes = input.text(page);
    const File file(bytes);
    const std::string all = readAll(shape, file);
    check(all == bytes || (shape.format == "csv" && bytes.starts_with(all)), "all is read, once");
    shape.skip = skip;
    check(all.ends_with(readAll(shape, file)), "what is not skipped is the rest");
  } catch (const Error &refused) {
    check(refused.code() != 0, "an error with a code");
  }
  return 0;
}
