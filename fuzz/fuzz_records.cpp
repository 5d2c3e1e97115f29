// The readers of records and of lines: whatever is in a file, all of it comes back, in order, cut
// where it must be.

#include "checks.h"
#include "convert/record_reader.h"
#include "errors.h"
#include "text/lines.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <unistd.h>

namespace {

using fuzz::check;
using namespace nls2::tool;

// A file in memory, by a name that opens it.
class File {
public:
  explicit File(const std::string &bytes) : fd_(memfd_create("fuzz", 0)) {
    check(write(fd_, bytes.data(), bytes.size()) == static_cast<ssize_t>(bytes.size()), "a file");
  }
  ~File() { close(fd_); }
  File(const File &) = delete;
  File &operator=(const File &) = delete;

  std::string path() const { return "/proc/self/fd/" + std::to_string(fd_); }

private:
  int fd_;
};

void checkBatches(const TranslateOptions &options, const std::string &bytes, const File &file) {
  InputFile input(file.path());
  RecordReader reader(input, options);
  std::string read;
  size_t expectedBefore = 0;
  for (;;) {
    RecordBatch batch;
    if (!reader.read(batch)) {
      break;
    }
    check(batch.offset == read.size(), "a batch knows where it begins");
    check(batch.recordsBefore == expectedBefore, "and how many records were before");
    batch.forEach([&](std::string_view record, std::string_view whole) {
      check(whole.starts_with(record), "a line begins with its text");
      check(options.recordLength == 0 || record.size() == options.recordLength ||
                read.size() + whole.size() == bytes.size(),
            "only the last record is short");
      read += whole;
      ++expectedBefore;
      return true;
    });
  }
  check(read == bytes, "all is read, once");
}

void checkLines(size_t recordLength, int32_t page, const std::string &bytes, const File &file) {
  const std::string terminator = recordLength == 0 ? lineTerminator(page) : "";
  LineReader reader(file.path(), terminator, recordLength);
  std::string read;
  while (const auto line = reader.next()) {
    check(recordLength == 0 || line->size() == recordLength, "a whole record");
    read.append(*line).append(terminator);
  }
  check(read == bytes || read == bytes + terminator, "all lines are read, once");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider input(data, size);
  TranslateOptions options;
  options.from = fuzz::page(input).number;
  options.recordLength = input.ConsumeIntegralInRange<size_t>(0, 40);
  const std::string bytes = input.ConsumeRemainingBytesAsString();
  const File file(bytes);
  try {
    checkBatches(options, bytes, file);
  } catch (const Error &refused) {
    check(refused.code() != 0, "an error with a code");
  }
  try {
    checkLines(options.recordLength, options.from, bytes, file);
  } catch (const Error &refused) {
    check(refused.code() != 0, "an error with a code");
  }
  return 0;
}
