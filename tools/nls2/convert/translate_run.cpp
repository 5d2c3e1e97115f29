// The work of `nls2 translate`: a file of records, from input to output.

#include "convert/translate_run.h"

#include "convert/pipeline.h"
#include "convert/progress.h"
#include "convert/record_reader.h"
#include "convert/record_translator.h"
#include "convert/tally.h"
#include "errors.h"
#include "io/input_file.h"
#include "io/output_file.h"
#include "io/wake_flag.h"

#include <algorithm>
#include <memory>
#include <sys/stat.h>

namespace nls2::tool {

namespace {

constexpr std::size_t usualOutput = std::size_t{2} << 20;

struct Piece {
  RecordBatch batch;
  ByteBuffer output;
  ByteBuffer rejects;
  Tally tally;

  std::size_t weight() const { return batch.bytes.size(); }
};

// The files of a run; those that are not wanted are null.
struct Files {
  std::unique_ptr<InputFile> input;
  std::unique_ptr<OutputFile> output;
  std::unique_ptr<OutputFile> rejects;
};

std::unique_ptr<OutputFile> openOutput(const std::string &path) {
  return path.empty() ? nullptr : std::make_unique<OutputFile>(path);
}

// Two descriptors of one regular file. What is read would be lost, or grow without end, where it is
// written to at the same time.
bool areSameFile(int first, int second) {
  struct stat one = {};
  struct stat two = {};
  return first >= 0 && second >= 0 && fstat(first, &one) == 0 && fstat(second, &two) == 0 &&
         S_ISREG(one.st_mode) && one.st_dev == two.st_dev && one.st_ino == two.st_ino;
}

void refuseSameFile(const InputFile &input, const OutputFile &output) {
  if (areSameFile(input.fd(), output.directFd())) {
    throw usageError("{} is also {}; give --output, which replaces it at the end", input.name(),
                     output.name());
  }
}

std::optional<uint64_t> bytesToRead(const InputFile &input, const TranslateOptions &options) {
  auto left = input.bytesLeft();
  if (left && options.recordLength != 0) {
    const uint64_t skipped = std::min(options.skip, *left / options.recordLength);
    *left -= skipped * options.recordLength;
    *left = std::min(*left / options.recordLength, options.count) * options.recordLength;
  }
  return left;
}

// The steps of the pipeline.
class TranslateRun {
public:
  TranslateRun(const TranslateOptions &options, const RecordTranslator &translator, Files &files,
               Tally &tally)
      : options_(options), translator_(translator), files_(files), tally_(tally),
        unit_(options.recordLength == 0 ? "line" : "record"),
        reader_(*files.input, options, wake_.fd()),
        progress_(options.progress, bytesToRead(*files.input, options)) {}

  void run() { Pipeline<Piece, TranslateRun>(*this).run(); }

  bool read(Piece &piece) { return reader_.read(piece.batch); }
  RecordTranslator worker() const { return translator_; }
  void work(RecordTranslator &worker, Piece &piece) const;
  void write(Piece &piece);
  void interrupt() const { wake_.raise(); }

private:
  bool translate(RecordTranslator &worker, std::string_view record, std::string_view whole,
                 Piece &piece) const;
  bool refuse(Problem problem, std::string_view whole, Piece &piece) const;
  void place(Problem &problem, const Piece &piece) const;

  const TranslateOptions &options_;
  const RecordTranslator &translator_;
  Files &files_;
  Tally &tally_;
  const std::string_view unit_;
  const WakeFlag wake_;
  RecordReader reader_;
  Progress progress_;
};

// The work buffers of a worker grow with the longest record: those for a very long one are not
// kept.
void TranslateRun::work(RecordTranslator &worker, Piece &piece) const {
  piece.output.clear(usualOutput);
  piece.rejects.clear(usualOutput);
  piece.tally = {};
  std::optional<RecordTranslator> passing;
  if (piece.batch.size() > usualOutput) {
    passing.emplace(translator_);
  }
  piece.batch.forEach([&](std::string_view record, std::string_view whole) {
    return translate(passing ? *passing : worker, record, whole, piece);
  });
  piece.tally.bytesOut = piece.output.size();
}

// False ends the piece, and the run.
bool TranslateRun::translate(RecordTranslator &worker, std::string_view record,
                             std::string_view whole, Piece &piece) const {
  if (record.size() < options_.recordLength) {
    Problem problem;
    problem.kind = ProblemKind::shortRecord;
    problem.needed = record.size();
    problem.limit = options_.recordLength;
    return refuse(problem, whole, piece);
  }
  std::size_t replaced = 0;
  if (const auto problem = worker.translate(record, piece.output, replaced)) {
    return refuse(*problem, whole, piece);
  }
  if (replaced > 0) {
    if (!piece.tally.first) {
      piece.tally.first = worker.firstReplaced(record);
      place(*piece.tally.first, piece);
    }
    piece.tally.replaced += replaced;
    ++piece.tally.replacedRecords;
  }
  ++piece.tally.records;
  piece.tally.bytesIn += whole.size();
  return true;
}

bool TranslateRun::refuse(Problem problem, std::string_view whole, Piece &piece) const {
  place(problem, piece);
  if (options_.onError != OnError::reject || problem.kind == ProblemKind::noMemory) {
    piece.tally.failure = problem;
    return false;
  }
  if (!piece.tally.first) {
    piece.tally.first = problem;
  }
  piece.rejects.append(whole);
  ++piece.tally.rejected;
  ++piece.tally.records;
  piece.tally.bytesIn += whole.size();
  return true;
}

// Of the record that comes after those counted in the piece.
void TranslateRun::place(Problem &problem, const Piece &piece) const {
  problem.record = piece.batch.recordsBefore + piece.tally.records;
  problem.byte = piece.batch.offset + piece.tally.bytesIn;
}

void TranslateRun::write(Piece &piece) {
  if (files_.output) {
    files_.output->write(piece.output.bytes());
  }
  if (files_.rejects) {
    files_.rejects->write(piece.rejects.bytes());
  }
  tally_.add(piece.tally);
  progress_.update(tally_.bytesIn);
  if (const auto &problem = piece.tally.failure) {
    throw failure("{}: {}: {}{}", files_.input->name(), placeOf(*problem, unit_),
                  reasonOf(*problem), adviceOn(*problem));
  }
  piece.output.clear(usualOutput);
}

void openFiles(const TranslateOptions &options, Files &files) {
  files.input = std::make_unique<InputFile>(options.input);
  files.output = options.dryRun ? nullptr : openOutput(options.output);
  files.rejects = openOutput(options.rejects);
  for (const auto *output : {files.output.get(), files.rejects.get()}) {
    if (output != nullptr) {
      refuseSameFile(*files.input, *output);
    }
  }
}

void translateAll(const TranslateOptions &options, const RecordTranslator &translator,
                  Tally &tally) {
  Files files;
  openFiles(options, files);
  const auto summarize = [&] {
    const std::string summary = summaryOf(tally, options.recordLength == 0 ? "line" : "record");
    if (!summary.empty()) {
      complain((files.input->name() + ": " + summary).c_str());
    }
  };
  try {
    TranslateRun(options, translator, files, tally).run();
  } catch (const Error &) {
    summarize();
    throw;
  }
  for (OutputFile *output : {files.output.get(), files.rejects.get()}) {
    if (output != nullptr) {
      output->commit(options.sync);
    }
  }
  summarize();
}

// The report comes last of all, after a failure too.
class Report {
public:
  explicit Report(const TranslateOptions &options)
      : options_(options), file_(openOutput(options.report)) {}

  void write(const Tally &tally) {
    if (file_) {
      file_->write(reportOf(tally, options_, clock_.seconds()));
      file_->commit(options_.sync);
    }
  }

private:
  const TranslateOptions &options_;
  std::unique_ptr<OutputFile> file_;
  const Progress clock_{false, {}};
};

} // namespace

int translateFile(const TranslateOptions &options) {
  const RecordTranslator translator(options);
  Report report(options);
  Tally tally;
  try {
    translateAll(options, translator, tally);
  } catch (...) {
    report.write(tally);
    throw;
  }
  report.write(tally);
  return tally.rejected > 0 ? exitFailed : exitDone;
}

} // namespace nls2::tool
