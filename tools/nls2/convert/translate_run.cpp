// The work of `nls2 translate`: a file of records, from input to output.

#include "convert/pipeline.h"
#include "convert/progress.h"
#include "convert/record_translator.h"
#include "errors.h"
#include "io/input_file.h"
#include "io/output_file.h"
#include "text/record_reader.h"

#include <memory>

namespace nls2::tool {

namespace {

constexpr std::size_t usualOutput = std::size_t{2} << 20;

struct Piece {
  RecordBatch batch;
  ByteBuffer output;
  ByteBuffer rejects;
  Tally tally;

  std::size_t weight() const { return batch.size(); }
};

// Two descriptors of one regular file. What is read would be lost, or grow without end, where it is
// written to at the same time.
bool areSameFile(int first, int second) {
  struct stat one = {};
  struct stat two = {};
  return second >= 0 && fstat(first, &one) == 0 && fstat(second, &two) == 0 &&
         S_ISREG(one.st_mode) && one.st_dev == two.st_dev && one.st_ino == two.st_ino;
}

std::unique_ptr<OutputFile> openOutput(const std::string &path, const InputFile *input = nullptr) {
  auto file = path.empty() ? nullptr : std::make_unique<OutputFile>(path);
  if (file && input != nullptr && areSameFile(input->fd(), file->directFd())) {
    throw usageError("{} is also {}; give --output, which replaces it at the end", input->name(),
                     file->name());
  }
  return file;
}

std::optional<uint64_t> bytesToRead(const InputFile &input, const TranslateOptions &options) {
  const auto left = input.bytesLeft();
  if (!left || options.recordLength == 0) {
    return left;
  }
  const uint64_t records = *left / options.recordLength;
  const uint64_t skipped = std::min(options.skip, records);
  return std::min(records - skipped, options.count) * options.recordLength;
}

// The bytes that a record takes in the output at the least, where it is filled.
std::size_t filledLength(const TranslateOptions &options) {
  const std::size_t filled = options.padding == nls2::padding::fill ? options.outLength : 0;
  std::size_t length = options.fields.empty() ? filled : 0;
  for (const FieldSpec &field : options.fields) {
    length += field.width != 0 ? field.width : filled;
  }
  return length;
}

// Batches are small enough for their output to be small too.
RecordShape shapeOf(const TranslateOptions &options) {
  return {.length = options.recordLength,
          .page = options.from,
          .skip = options.skip,
          .count = options.count,
          .mostInBatch = std::max<uint64_t>(usualOutput / (filledLength(options) + 1), 1)};
}

// The steps of the pipeline, and the files; those that are not wanted are null.
class TranslateRun {
public:
  TranslateRun(const TranslateOptions &options, const RecordTranslator &translator, Tally &tally)
      : options_(options), translator_(translator), tally_(tally), input_(options.input),
        output_(openOutput(options.dryRun ? "" : options.output, &input_)),
        rejects_(openOutput(options.rejects, &input_)), reader_(input_, shapeOf(options)),
        progress_(options.progress, bytesToRead(input_, options)) {}

  void run();

  bool read(Piece &piece) { return reader_.read(piece.batch); }
  RecordTranslator worker() const { return translator_; }
  void work(RecordTranslator &worker, Piece &piece) const;
  void write(Piece &piece);
  void interrupt() { input_.interrupt(); }

private:
  bool translate(RecordTranslator &worker, const Record &record, Piece &piece) const;
  void summarize();

  const TranslateOptions &options_;
  const RecordTranslator &translator_;
  Tally &tally_;
  InputFile input_;
  const std::unique_ptr<OutputFile> output_;
  const std::unique_ptr<OutputFile> rejects_;
  RecordReader reader_;
  Progress progress_;
};

void TranslateRun::run() {
  try {
    Pipeline<Piece, TranslateRun>(*this).run();
  } catch (const Error &) {
    summarize();
    throw;
  }
  progress_.clear();
  for (OutputFile *file : {output_.get(), rejects_.get()}) {
    if (file != nullptr) {
      file->commit(options_.sync);
    }
  }
  summarize();
}

void TranslateRun::summarize() {
  progress_.clear();
  const std::string summary = summaryOf(tally_, options_.unit());
  if (!summary.empty()) {
    complain((input_.name() + ": " + summary).c_str());
  }
}

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
  bool goesOn = true;
  for (auto record = piece.batch.next(); record && goesOn; record = piece.batch.next()) {
    goesOn = translate(passing ? *passing : worker, *record, piece);
  }
  piece.tally.bytesOut = piece.output.size();
}

// False ends the piece, and the run.
bool TranslateRun::translate(RecordTranslator &worker, const Record &record, Piece &piece) const {
  Tally &tally = piece.tally;
  std::size_t replaced = 0;
  std::optional<Problem> problem = worker.translate(record.text, piece.output, replaced);
  const bool isRefused = problem.has_value();
  if (replaced > 0 && !tally.first) {
    problem = worker.firstReplaced(record.text);
  }
  if (problem) {
    problem->record = record.number;
    problem->byte = record.offset;
    const bool isRejected =
        options_.onError == OnError::reject && problem->kind != ProblemKind::noMemory;
    if (isRefused && !isRejected) {
      tally.failure = problem;
      return false;
    }
    tally.first = tally.first ? tally.first : problem;
  }
  if (isRefused) {
    piece.rejects.append(record.whole);
    ++tally.rejected;
  }
  tally.replaced += replaced;
  tally.replacedRecords += replaced > 0 ? 1 : 0;
  ++tally.records;
  tally.bytesIn += record.whole.size();
  return true;
}

void TranslateRun::write(Piece &piece) {
  if (output_) {
    output_->write(piece.output.bytes());
  }
  if (rejects_) {
    rejects_->write(piece.rejects.bytes());
  }
  tally_.add(piece.tally);
  progress_.update(tally_.bytesIn);
  if (const auto &problem = piece.tally.failure) {
    const auto [reason, advice] = explain(*problem);
    throw failure("{}: {}: {}{}", input_.name(), placeOf(*problem, options_.unit()), reason,
                  advice);
  }
  piece.output.clear(usualOutput);
}

} // namespace

// The report comes last of all, after a failure too.
int translateFile(const TranslateOptions &options) {
  const RecordTranslator translator(options);
  const auto report = openOutput(options.report);
  const auto start = std::chrono::steady_clock::now();
  Tally tally;
  const auto writeReport = [&] {
    if (report) {
      const std::chrono::duration<double> passed = std::chrono::steady_clock::now() - start;
      report->write(reportOf(tally, options, passed.count()));
      report->commit(options.sync);
    }
  };
  try {
    TranslateRun(options, translator, tally).run();
  } catch (...) {
    writeReport();
    throw;
  }
  writeReport();
  return tally.rejected > 0 ? exitFailed : exitDone;
}

} // namespace nls2::tool
