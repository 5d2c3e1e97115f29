// The work of `nls2 translate`: a file of records, from input to output.

#include "base/errors.h"
#include "convert/pipeline.h"
#include "convert/progress.h"
#include "convert/record_translator.h"
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

// Null if not requested.
struct Files {
  InputFile input;
  const std::unique_ptr<OutputFile> output;
  const std::unique_ptr<OutputFile> rejects;
  const std::unique_ptr<OutputFile> report;

  // Throws Error, also if one file would overwrite another. Only the output may replace the input.
  explicit Files(const TranslateOptions &options)
      : input(options.input),
        output(options.dryRun ? nullptr : std::make_unique<OutputFile>(options.output)),
        rejects(opened(options.rejects)), report(opened(options.report)) {
    if (output && output->isDirect() && output->isSame(input.facts())) {
      throw usageError("{} is also {}; use --output, which replaces the file at the end",
                       input.name(), output->name());
    }
    requireOthers("--rejects", rejects.get(), {output.get()});
    requireOthers("--report", report.get(), {output.get(), rejects.get()});
  }

private:
  static std::unique_ptr<OutputFile> opened(const std::optional<std::string> &path) {
    return path ? std::make_unique<OutputFile>(*path) : nullptr;
  }

  void requireOthers(const char *option, const OutputFile *file,
                     std::initializer_list<const OutputFile *> others) const {
    if (file != nullptr && file->isSame(input.facts())) {
      throw usageError("{} names the input", option);
    }
    for (const OutputFile *other : others) {
      if (file != nullptr && other != nullptr && file->isSame(*other)) {
        throw usageError("{} names a file that another option writes", option);
      }
    }
  }
};

std::optional<uint64_t> bytesToRead(const InputFile &input, const TranslateOptions &options) {
  const auto left = input.bytesLeft();
  if (!left || options.recordLength == 0) {
    return left;
  }
  const uint64_t records = *left / options.recordLength;
  const uint64_t skipped = std::min(options.skip, records);
  return std::min(records - skipped, options.count) * options.recordLength;
}

// The least length of a filled record in the output, in bytes; 0 if it is not filled.
std::size_t filledLength(const TranslateOptions &options) {
  const std::size_t filled = options.padding == nls2::padding::fill ? options.outLength : 0;
  std::size_t length = options.fields.empty() ? filled : 0;
  for (const FieldSpec &field : options.fields) {
    length += field.width != 0 ? field.width : filled;
  }
  return length;
}

// Batches are small, so that their output is small too.
RecordShape shapeOf(const TranslateOptions &options) {
  return {.length = options.recordLength,
          .page = options.from,
          .skip = options.skip,
          .count = options.count,
          .mostInBatch = std::max<uint64_t>(usualOutput / (filledLength(options) + 1), 1)};
}

// The steps of the pipeline.
class TranslateRun {
public:
  TranslateRun(const TranslateOptions &options, const RecordTranslator &translator, Files &files,
               Tally &tally)
      : options_(options), translator_(translator), files_(files), tally_(tally),
        reader_(files.input, shapeOf(options)),
        progress_(options.progress, bytesToRead(files.input, options)) {}

  void run();

  bool read(Piece &piece) { return reader_.read(piece.batch); }
  RecordTranslator worker() const { return translator_; }
  void work(RecordTranslator &worker, Piece &piece) const;
  void write(Piece &piece);
  void interrupt() { files_.input.interrupt(); }

private:
  bool translate(RecordTranslator &worker, const Record &record, Piece &piece) const;
  void summarize();

  const TranslateOptions &options_;
  const RecordTranslator &translator_;
  Files &files_;
  Tally &tally_;
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
  clearProgress();
  for (OutputFile *file : {files_.output.get(), files_.rejects.get()}) {
    if (file != nullptr) {
      file->commit(options_.sync);
    }
  }
  summarize();
}

void TranslateRun::summarize() {
  clearProgress();
  const std::string summary = summaryOf(tally_, options_.unit());
  if (!summary.empty()) {
    complain((files_.input.name() + ": " + summary).c_str());
  }
}

// A worker's buffers grow with its longest record, so a batch with a very long record gets a
// translator of its own.
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

// False ends the piece and the run.
bool TranslateRun::translate(RecordTranslator &worker, const Record &record, Piece &piece) const {
  Tally &tally = piece.tally;
  std::size_t replaced = 0;
  std::optional<Problem> problem = worker.translate(record.text, piece.output, replaced);
  const bool isRefused = problem.has_value();
  if (!isRefused && replaced > 0 && !tally.first) {
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
  if (files_.output) {
    files_.output->write(piece.output.bytes());
  }
  if (files_.rejects) {
    files_.rejects->write(piece.rejects.bytes());
  }
  tally_.add(piece.tally);
  progress_.update(tally_.bytesIn);
  if (const auto &problem = piece.tally.failure) {
    const auto [reason, advice] = explain(*problem);
    throw failure("{}: {}: {}{}", files_.input.name(), placeOf(*problem, options_.unit()), reason,
                  advice);
  }
  piece.output.clear(usualOutput);
}

} // namespace

// The report is written last, and after a failure too.
int translateFile(const TranslateOptions &options) {
  const RecordTranslator translator(options);
  Files files(options);
  const auto start = std::chrono::steady_clock::now();
  Tally tally;
  const auto writeReport = [&] {
    if (const auto &report = files.report) {
      const std::chrono::duration<double> passed = std::chrono::steady_clock::now() - start;
      report->write(reportOf(tally, options, passed.count()));
      report->commit(options.sync);
    }
  };
  try {
    TranslateRun(options, translator, files, tally).run();
  } catch (const Error &) {
    try {
      writeReport();
    } catch (const Error &second) {
      complain(second.what());
    }
    throw;
  }
  writeReport();
  return tally.rejected > 0 ? exitFailed : exitDone;
}

} // namespace nls2::tool
