// The readers of records and lines: all bytes of a file come back, in order, divided correctly.

#include "base/errors.h"
#include "property.h"
#include "text/record_reader.h"

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

void checkBatches(const RecordShape &shape, const std::string &bytes, const File &file) {
  InputFile input(file.path());
  RecordReader reader(input, shape);
  RecordBatch batch;
  std::string read;
  uint64_t records = 0;
  while (reader.read(batch)) {
    while (const auto record = batch.next()) {
      check(record->offset == read.size() && record->number == ++records, "it knows its place");
      check(record->whole.starts_with(record->text), "a line begins with its text");
      check(shape.length == 0 || record->text.size() == shape.length ||
                read.size() + record->whole.size() == bytes.size(),
            "only the last record is short");
      read += record->whole;
    }
  }
  check(read == bytes, "all is read, once");
}

void checkFile(const RecordShape &shape, const std::string &bytes, const File &file) {
  const std::string terminator =
      shape.length == 0 ? lineFeedOf(CodePage(shape.page, ""), !shape.isText) : "";
  RecordFile records(file.path(), shape);
  std::string read;
  while (const auto record = records.next()) {
    check(shape.length == 0 || record->text.size() == shape.length, "a whole record");
    read.append(record->text).append(terminator);
  }
  check(shape.isText || read == bytes || read == bytes + terminator, "all lines are read, once");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  property::Input input(data, size);
  RecordShape shape;
  const property::Page page = input.page();
  shape.page = page.number;
  shape.length = input.below(41);
  shape.isText = input.flag();
  shape.mostInBatch = 1 + input.below(4);
  const std::string bytes = input.text(page);
  const File file(bytes);
  try {
    checkBatches(shape, bytes, file);
  } catch (const Error &refused) {
    check(refused.code() != 0, "an error with a code");
  }
  try {
    checkFile(shape, bytes, file);
  } catch (const Error &refused) {
    check(refused.code() != 0, "an error with a code");
  }
  return 0;
}
