// The work of `nls2 translate`: a file of records, from input to output.

#include "base/errors.h"
#include "convert/pipeline.h"
#include "convert/progress.h"
#include "convert/record_translator.h"
#include "io/input_file.h"
#include "io/output_file.h"

#include <algorithm>
#include <memory>

namespace nls2::tool {

namespace {

constexpr std::size_t usualOutput = std::size_t{2} << 20;

struct Piece {
  RecordPiece records;
  PieceOutput output;

  std::size_t weight() const { return records.bytes.size(); }
};

// Null if not requested.
struct Files {
  InputFile input;
  std::unique_ptr<OutputFile> output;
  std::unique_ptr<OutputFile> rejects;
  std::unique_ptr<OutputFile> problems;
  std::unique_ptr<OutputFile> report;

  // Throws Error, also if one file would overwrite another. Only the output may replace the input.
  explicit Files(const TranslateOptions &options)
      : input(options.input),
        output(options.dryRun ? nullptr : std::make_unique<OutputFile>(options.output)),
        rejects(opened(options.rejects)), problems(opened(options.problems)),
        report(opened(options.report)) {
    if (output && output->isDirect() && output->isSame(input.facts())) {
      throw usageError("{} is also {}; use --output, which replaces the file at the end",
                       input.name(), output->name());
    }
    requireOthers("--rejects", rejects.get(), {output.get()});
    requireOthers("--problems", problems.get(), {output.get(), rejects.get()});
    requireOthers("--report", report.get(), {output.get(), rejects.get(), problems.get()});
  }

  // All are complete before the first takes its name. The output is the last, so that an input that
  // it replaces is there until then.
  void commit(bool sync) {
    const std::initializer_list<OutputFile *> files{rejects.get(), problems.get(), report.get(),
                                                    output.get()};
    for (OutputFile *file : files) {
      if (file != nullptr) {
        file->finish(sync);
      }
    }
    std::string written;
    for (OutputFile *file : files) {
      if (file != nullptr) {
        publish(*file, sync, written);
      }
    }
  }

private:
  static std::unique_ptr<OutputFile> opened(const std::optional<std::string> &path) {
    return path ? std::make_unique<OutputFile>(*path) : nullptr;
  }

  static void publish(OutputFile &file, bool sync, std::string &written) {
    try {
      file.publish(sync);
    } catch (const Error &error) {
      throw written.empty() ? error : failure("{}; already written: {}", error.what(), written);
    }
    if (!file.isDirect()) {
      written += (written.empty() ? "" : ", ") + file.name();
    }
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

std::optional<uint64_t> bytesToRead(const InputFile &input, const TranslateOptions &options,
                                    const Plan &plan) {
  const auto left = input.bytesLeft();
  if (!left || plan.readLength == 0) {
    return left;
  }
  const auto length = static_cast<uint64_t>(plan.readLength);
  const uint64_t records = *left / length;
  const uint64_t skipped = std::min(options.skip, records);
  return std::min(records - skipped, options.count) * length;
}

// Pieces are small, so that what becomes of them is small too.
RecordShape shapeOf(const TranslateOptions &options, const Plan &plan) {
  const auto filled =
      static_cast<uint64_t>(std::max(plan.writeLength, plan.fillsLayout() ? plan.layoutLength : 0));
  const uint64_t most = std::min(usualOutput / (filled + 1), (1U << 15) / plan.fields.size());
  return {.format = options.read,
          .page = plan.from,
          .hasHeader = plan.hasHeader && plan.readsCsv,
          .skip = options.skip,
          .count = options.count,
          .mostInPiece = std::max<uint64_t>(most, 1)};
}

// The names of the fields as a record of CSV.
std::string headerOf(const Plan &plan) {
  std::string names;
  std::vector<NLS2F_Span> spans;
  for (const FieldPlan &field : plan.fields) {
    const std::string_view name = field.field.name;
    spans.push_back({sizeOf(names), sizeOf(name)});
    names += name;
  }
  std::string record(2 * names.size() + 3 * spans.size(), '\0');
  int64_t written = 0;
  isDone(NLS2F_JoinCsv(names.data(), spans.data(), static_cast<int64_t>(spans.size()),
                       record.data(), sizeOf(record), &written, nullptr));
  record.resize(static_cast<std::size_t>(written));
  return record;
}

// The steps of the pipeline.
class TranslateRun {
public:
  TranslateRun(const TranslateOptions &options, Plan &plan, Files &files, Tally &tally)
      : options_(options), plan_(plan), files_(files), tally_(tally),
        source_(files.input, shapeOf(options, plan)),
        progress_(options.progress, bytesToRead(files.input, options, plan)) {
    for (std::size_t i = 0; i < plan.fields.size(); ++i) {
      columns_.push_back(i);
    }
    RecordTranslator(options, plan, columns_); // finds wrong options before the work
  }

  void run();
  void summarize() const;

  bool read(Piece &piece);
  std::unique_ptr<RecordTranslator> worker() const {
    return std::make_unique<RecordTranslator>(options_, plan_, columns_);
  }
  void work(std::unique_ptr<RecordTranslator> &worker, Piece &piece) const;
  void write(Piece &piece);
  void interrupt() const { files_.input.interrupt(); }

private:
  void begin();
  void findColumns();
  void writeHeader();
  void writeProblems(const Piece &piece);

  const TranslateOptions &options_;
  Plan &plan_;
  Files &files_;
  Tally &tally_;
  RecordSource source_;
  Progress progress_;
  CsvColumns columns_;
  bool hasBegun_ = false;
  bool hasPreamble_ = false; // the rejects
};

void TranslateRun::run() {
  writeHeader();
  Pipeline<Piece, TranslateRun>(*this).run();
  if (options_.skip > 0 && tally_.records == 0) {
    complain(fmt::format("{}: no record follows the {} skipped", files_.input.name(), options_.skip)
                 .c_str());
  }
}

void TranslateRun::summarize() const {
  clearProgress();
  const std::string summary = summaryOf(tally_, plan_.unit(options_));
  if (!summary.empty()) {
    complain((files_.input.name() + ": " + summary).c_str());
  }
}

void TranslateRun::writeHeader() {
  if (!plan_.hasHeader || !plan_.writesCsv || !files_.output) {
    return;
  }
  const std::string header = headerOf(plan_);
  const NLS2F_Span span{0, sizeOf(header)};
  std::string bytes(header.size() + 2, '\0');
  int64_t written = 0;
  int64_t done = 0;
  isDone(NLS2F_WriteRecords(openWriter("--write", options_.write, plan_.to).get(), header.data(),
                            &span, 1, bytes.data(), sizeOf(bytes), &written, &done, nullptr));
  files_.output->write(std::string_view(bytes).substr(0, static_cast<std::size_t>(written)));
}

// The first read shows the page and the header, before any thread works.
bool TranslateRun::read(Piece &piece) {
  const bool more = source_.read(piece.records);
  if (!hasBegun_) {
    hasBegun_ = true;
    begin();
  }
  return more;
}

void TranslateRun::begin() {
  if (const CodePage page = source_.page(); !(page == plan_.from)) {
    plan_.setFrom(page);
  }
  if (plan_.hasHeader && plan_.readsCsv) {
    findColumns();
  }
}

void TranslateRun::findColumns() {
  if (!source_.foundHeader()) {
    throw failure("{}: the header with the names of the fields is missing", files_.input.name());
  }
  std::string header = source_.header();
  std::string names(header.size(), '\0');
  std::vector<NLS2F_Span> spans(header.size() + 1);
  auto problem = sized<NLS2F_Problem>();
  int64_t count = 0;
  if (!isDone(NLS2F_SplitCsv(header.data(), sizeOf(header), names.data(), spans.data(),
                             static_cast<int64_t>(spans.size()), &count, &problem))) {
    throw failure("{}: the header: {}", files_.input.name(), wordsOf(problem));
  }
  spans.resize(static_cast<std::size_t>(count));
  const auto isNamed = [&](const NLS2F_Span &span, const FieldPlan &field) {
    return bytesOf(names.data(), span) == field.field.name;
  };
  for (const FieldPlan &field : plan_.fields) {
    const auto found =
        std::ranges::find_if(spans, [&](const auto &span) { return isNamed(span, field); });
    if (found == spans.end()) {
      throw failure("{}: the header has no field {}", files_.input.name(),
                    printable(field.field.name));
    }
    columns_[field.number - 1] = static_cast<std::size_t>(found - spans.begin());
  }
  for (std::size_t i = 0; i < spans.size(); ++i) {
    if (std::ranges::find(columns_, i) == columns_.end()) {
      throw failure("{}: the header's field {}, \"{}\", is {}", files_.input.name(), i + 1,
                    printable(bytesOf(names.data(), spans[i])),
                    std::ranges::any_of(plan_.fields,
                                        [&](const auto &field) { return isNamed(spans[i], field); })
                        ? "there twice"
                        : "not in the layout");
    }
  }
}

void TranslateRun::work(std::unique_ptr<RecordTranslator> &worker, Piece &piece) const {
  for (ByteBuffer *each : {&piece.output.bytes, &piece.output.rejects, &piece.output.problems}) {
    each->clear(usualOutput);
  }
  piece.output.tally = {};
  worker->translate(piece.records, piece.output);
}

void TranslateRun::write(Piece &piece) {
  const std::string_view rejects = piece.output.rejects.bytes();
  if (files_.output) {
    files_.output->write(piece.output.bytes.bytes());
  }
  if (files_.rejects && !rejects.empty()) {
    files_.rejects->write(std::exchange(hasPreamble_, true) ? "" : source_.preamble());
    files_.rejects->write(rejects);
  }
  writeProblems(piece);
  tally_.add(piece.output.tally);
  progress_.update(tally_.bytesIn);
  if (const auto &problem = piece.output.tally.failure) {
    throw failure("{}: {}{}", files_.input.name(), messageOf(*problem, plan_.unit(options_)),
                  adviceFor(*problem));
  }
  piece.output.bytes.clear(usualOutput);
}

// No more lines than the limit.
void TranslateRun::writeProblems(const Piece &piece) {
  const uint64_t limit = options_.problemsLimit;
  uint64_t left = limit - std::min(limit, tally_.lines);
  const std::string_view lines = piece.output.problems.bytes();
  std::size_t end = 0;
  for (; left > 0 && end < lines.size(); --left) {
    end = lines.find('\n', end) + 1;
  }
  if (files_.problems) {
    files_.problems->write(lines.substr(0, end));
  }
}

} // namespace

// A run that fails leaves all files as they were, but for the report.
int translateFile(const TranslateOptions &options) {
  Plan plan(options);
  Files files(options);
  const auto start = std::chrono::steady_clock::now();
  Tally tally;
  const auto writeReport = [&](bool isDone) {
    if (files.report) {
      const std::chrono::duration<double> passed = std::chrono::steady_clock::now() - start;
      files.report->write(reportOf(tally, plan, passed.count(), isDone));
    }
  };
  TranslateRun run(options, plan, files, tally);
  try {
    try {
      run.run();
    } catch (const Error &) {
      run.summarize();
      throw;
    }
    run.summarize();
    writeReport(true);
    files.commit(options.sync);
  } catch (const Error &) {
    try {
      if (files.report) { // it may be complete already, as that of a run that was done
        files.report = std::make_unique<OutputFile>(*options.report);
        writeReport(false);
        files.report->commit();
      }
    } catch (const Error &second) {
      complain(second.what());
    }
    throw;
  }
  return tally.rejected > 0 ? exitFailed : exitDone;
}

} // namespace nls2::tool
