// The work of `nls2 translate`: a file of records, from input to output.

#include "convert/translate_run.h"

#include "convert/pipeline.h"
#include "convert/record_reader.h"
#include "errors.h"
#include "io/input_file.h"
#include "io/output_file.h"

#include <fmt/core.h>
#include <sys/eventfd.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace nls2::tool {

namespace {

struct Piece {
  RecordChunk records;
  OutputBuffer output;
  std::string failure; // of the record that follows the output
};

// Becomes readable for good when it is raised.
class WakeFlag {
public:
  WakeFlag() : fd_(eventfd(0, EFD_CLOEXEC)) {
    if (fd_ < 0) {
      throw failure("cannot make an event descriptor");
    }
  }
  ~WakeFlag() { close(fd_); }
  WakeFlag(const WakeFlag &) = delete;
  WakeFlag &operator=(const WakeFlag &) = delete;

  int fd() const { return fd_; }
  void raise() const { eventfd_write(fd_, 1); }

private:
  const int fd_;
};

// A file that is read while it is written over would be lost, or grow without end.
void refuseSameFile(const InputFile &input, const OutputFile &output) {
  struct stat in = {};
  struct stat out = {};
  if (output.directFd() >= 0 && fstat(input.fd(), &in) == 0 &&
      fstat(output.directFd(), &out) == 0 && S_ISREG(in.st_mode) && in.st_dev == out.st_dev &&
      in.st_ino == out.st_ino) {
    throw usageError("{} is also standard output; give --output, which replaces it at the end",
                     input.name());
  }
}

class TranslateRun {
public:
  TranslateRun(const TranslateOptions &options, InputFile &input, OutputFile &output)
      : translator_(options), input_(input), output_(output),
        recordLength_(static_cast<std::size_t>(options.recordLength)),
        newline_(options.newline ? CodePage(options.to, "--to").encoded(u'\n')->bytes
                                 : std::string()),
        reader_(input, recordLength_, wake_.fd()), pieces_(pipeline_.slots()) {}

  void run() {
    pipeline_.run({[this](std::size_t slot) { return reader_.read(pieces_[slot].records); },
                   [this](std::size_t slot) { translate(pieces_[slot]); },
                   [this](std::size_t slot) { write(pieces_[slot]); }, [this] { wake_.raise(); }});
  }

private:
  void translate(Piece &piece) const {
    piece.output.clear();
    const RecordChunk &records = piece.records;
    for (std::size_t at = 0; at < records.length; at += recordLength_) {
      const auto refusal =
          translator_.translate({records.bytes.get() + at, recordLength_}, piece.output);
      if (refusal) {
        piece.failure = describe(records.recordsBefore + at / recordLength_, *refusal);
        return;
      }
      piece.output.append(newline_);
    }
    if (records.tail != 0) {
      piece.failure =
          describe(records.recordsBefore + records.length / recordLength_,
                   fmt::format("the input ends after {} of {} bytes; is --record-length {} right?",
                               records.tail, recordLength_, recordLength_));
    }
  }

  std::string describe(uint64_t recordsBefore, const std::string &reason) const {
    return fmt::format("{}: record {} at byte {}: {}", input_.name(), recordsBefore + 1,
                       recordsBefore * recordLength_, reason);
  }

  void write(Piece &piece) {
    output_.write(piece.output.bytes());
    if (!piece.failure.empty()) {
      throw failure("{}", piece.failure);
    }
  }

  const RecordTranslator translator_;
  const InputFile &input_;
  OutputFile &output_;
  const std::size_t recordLength_;
  const std::string newline_;
  const WakeFlag wake_;
  RecordReader reader_;
  Pipeline pipeline_;
  std::vector<Piece> pieces_;
};

void checkOptions(const TranslateOptions &options) {
  const CodePage from(options.from, "--from");
  const CodePage to(options.to, "--to");
  const bool needsBlank =
      options.padding == Padding::fill || options.padding == Padding::keepBlanks;
  if (needsBlank && !to.encoded(u' ')) {
    throw usageError("code page {} has no blank to pad with", options.to);
  }
  if (options.newline && !to.encoded(u'\n')) {
    throw usageError("code page {} has no line feed", options.to);
  }
}

} // namespace

void translateFile(const TranslateOptions &options, const std::string &inputPath,
                   const std::string &outputPath) {
  checkOptions(options);
  InputFile input(inputPath);
  OutputFile output(outputPath);
  refuseSameFile(input, output);
  TranslateRun(options, input, output).run();
  output.commit();
}

} // namespace nls2::tool
