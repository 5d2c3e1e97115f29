// A piece of records from one form to another.

#include "convert/record_translator.h"

#include <algorithm>
#include <cstring>

namespace nls2::tool {

namespace {

constexpr std::size_t usualSize = std::size_t{2} << 20;
constexpr std::size_t mostLineEnd = 8; // bytes, or of a prefix

// Where a field begins in a record of CSV.
int64_t offsetInCsv(std::string_view record, std::size_t field) {
  std::size_t at = 0;
  for (bool isQuoted = false; field > 0 && at < record.size(); ++at) {
    isQuoted = isQuoted != (record[at] == '"');
    field -= record[at] == ',' && !isQuoted ? 1 : 0;
  }
  return static_cast<int64_t>(at + (record.substr(at).starts_with('"') ? 1 : 0));
}

} // namespace

RecordTranslator::RecordTranslator(const TranslateOptions &options, const Plan &plan,
                                   const CsvColumns &columns)
    : options_(options), plan_(plan), columns_(columns),
      writer_(openWriter("--write", options.write, plan.to)), empty_(emptyRecord(plan)) {
  for (const FieldPlan &field : plan.fields) {
    fields_.emplace_back(field, plan, options.onError == OnError::replace);
  }
}

void RecordTranslator::translate(const RecordPiece &piece, PieceOutput &out) {
  piece_ = &piece;
  if (piece.problem) {
    reportRest(out);
    return;
  }
  rows_ = piece.records.size();
  found_.clear();
  dropped_.assign(rows_, 0);
  values_.resize(rows_ * fields_.size());
  if (plan_.readsCsv) {
    for (std::size_t row = 0; row < rows_; ++row) {
      translateSplit(row);
    }
  } else {
    for (std::size_t field = 0; field < fields_.size(); ++field) {
      translateColumn(field);
    }
  }
  write(out);
  report(out);
  out.tally.bytesOut = out.bytes.size();
  for (ByteBuffer *each : {&bytes_, &gathered_, &records_, &split_}) {
    each->clear(usualSize);
  }
  if (piece.bytes.size() > usualSize) { // translators grow with their longest field
    open_.clear();
  }
}

// One field of all records, or all records if they are of different lengths.
void RecordTranslator::translateColumn(std::size_t field) {
  const NLS2F_Field &place = plan_.fields[field].field;
  const char *bytes = piece_->bytes.bytes().data();
  if (!plan_.layout && plan_.readLength == 0) {
    for (std::size_t row = 0; row < rows_; ++row) {
      translateOne(row, field, piece_->text(row));
    }
    return;
  }
  FieldColumn column{bytes + piece_->records[0].offset + place.first, plan_.readLength,
                     static_cast<int64_t>(rows_)};
  if (plan_.readLength == 0) {
    gathered_.clear(usualSize);
    column.first = gathered_.room(rows_ * static_cast<std::size_t>(place.length)).data();
    column.stride = place.length;
    isDone(NLS2F_GatherFields(&place, bytes, piece_->records.data(), column.rows,
                              gathered_.room(0).data()));
  }
  fields_[field].translateAll(column, open_, bytes_, column_, good_);
  for (std::size_t row = 0; row < rows_; ++row) {
    const std::string_view source(column.row(static_cast<int64_t>(row)),
                                  static_cast<std::size_t>(place.length));
    if ((good_[row / 8] >> row % 8 & 1) == 0) {
      translateOne(row, field, source);
    } else {
      value(row, field) = column_[row];
      verify(row, field, source);
    }
  }
}

void RecordTranslator::translateSplit(std::size_t row) {
  const std::string_view record = piece_->text(row);
  auto problem = sized<NLS2F_Problem>();
  int64_t count = 0;
  const std::size_t most = fields_.size() + 1; // one is too many
  column_.resize(std::max(column_.size(), most));
  char *out = split_.room(record.size()).data();
  int32_t status = NLS2F_SplitCsv(record.data(), sizeOf(record), out, column_.data(),
                                  static_cast<int64_t>(column_.size()), &count, &problem);
  if (status == U_BUFFER_OVERFLOW_ERROR) {
    status = 0;
  }
  if (!isDone(status)) {
    add(row, nullptr, {problem, wordsOf(problem)});
  } else if (static_cast<std::size_t>(count) != fields_.size()) {
    problem.kind = wrongFields;
    add(row, nullptr,
        {problem, fmt::format("the record has {} fields in place of {}", count, fields_.size())});
  } else {
    for (std::size_t field = 0; field < fields_.size() && row < rows_; ++field) {
      translateOne(row, field, bytesOf(out, column_[columns_[field]]));
    }
  }
}

void RecordTranslator::translateOne(std::size_t row, std::size_t field, std::string_view source) {
  FieldResult result = fields_[field].translate(source, open_, bytes_, value(row, field));
  if (result.fault) {
    add(row, &plan_.fields[field], std::move(*result.fault), result.replaced);
  } else {
    verify(row, field, source);
  }
}

void RecordTranslator::verify(std::size_t row, std::size_t field, std::string_view source) {
  if (!options_.verify) {
    return;
  }
  const std::string_view translated = bytesOf(bytes_.bytes().data(), value(row, field));
  if (auto fault = fields_[field].verify(source, translated, open_)) {
    add(row, &plan_.fields[field], std::move(*fault));
  }
}

// Unless bad records are rejected, nothing after the first one matters.
void RecordTranslator::add(std::size_t row, const FieldPlan *field, FieldFault fault,
                           int64_t replaced) {
  const bool fails = replaced == 0;
  found_.push_back({row, field, std::move(fault), replaced});
  dropped_[row] = dropped_[row] != 0 || fails ? 1 : 0;
  if (fails && options_.onError != OnError::reject) {
    rows_ = std::min(rows_, row + 1);
  }
}

// A record as it is written, without its end or prefix.
void RecordTranslator::assemble(std::size_t row) {
  const std::size_t before = records_.size();
  const char *bytes = bytes_.bytes().data();
  if (plan_.writesCsv) {
    std::size_t room = 3 * fields_.size();
    for (std::size_t field = 0; field < fields_.size(); ++field) {
      room += 2 * static_cast<std::size_t>(value(row, field).length);
    }
    int64_t written = 0;
    isDone(NLS2F_JoinCsv(bytes, &value(row, 0), static_cast<int64_t>(fields_.size()),
                         records_.room(room).data(), static_cast<int64_t>(room), &written,
                         nullptr));
    records_.commit(static_cast<std::size_t>(written));
  } else {
    records_.append(empty_);
    for (std::size_t field = 0; field < fields_.size(); ++field) {
      const std::string_view part = bytesOf(bytes, value(row, field));
      if (plan_.joins) {
        records_.append(part);
      } else if (!part.empty()) {
        std::memcpy(records_.at(before + static_cast<std::size_t>(plan_.fields[field].field.first)),
                    part.data(), part.size());
      }
    }
  }
  column_.push_back({static_cast<int64_t>(before), static_cast<int64_t>(records_.size() - before)});
}

// Writes the records before the first that ends the run. One that its format cannot hold is a
// problem, too.
void RecordTranslator::write(PieceOutput &out) {
  const bool isWhole = fields_.size() == 1 && !plan_.writesCsv && !plan_.fillsLayout();
  std::vector<std::size_t> rows;
  column_.clear();
  std::size_t size = 0;
  for (std::size_t row = 0; row < rows_; ++row) {
    if (dropped_[row] != 0) {
      continue;
    }
    if (isWhole) {
      column_.push_back(value(row, 0));
    } else {
      assemble(row);
    }
    size += static_cast<std::size_t>(std::max(column_.back().length, plan_.writeLength));
    rows.push_back(row);
  }
  const char *bytes = (isWhole ? bytes_ : records_).bytes().data();
  for (std::size_t begin = 0; begin < rows.size() && rows[begin] < rows_;) {
    const auto room = static_cast<int64_t>(size + rows.size() * mostLineEnd);
    auto problem = sized<NLS2F_Problem>();
    int64_t written = 0;
    int64_t done = 0;
    const bool isFine = isDone(NLS2F_WriteRecords(
        writer_.get(), bytes, &column_[begin], static_cast<int64_t>(rows.size() - begin),
        out.bytes.room(static_cast<std::size_t>(room)).data(), room, &written, &done, &problem));
    out.bytes.commit(static_cast<std::size_t>(written));
    begin += static_cast<std::size_t>(done);
    if (!isFine) {
      add(rows[begin++], nullptr, {problem, wordsOf(problem)});
    }
  }
}

Problem RecordTranslator::problemOf(const Found &found) const {
  Problem problem;
  problem.kind = found.fault.found.kind;
  problem.record = piece_->number + found.row;
  problem.byte = piece_->offsetOf(found.row);
  problem.found = found.fault.found;
  problem.words = found.fault.words;
  if (found.field != nullptr) {
    const std::size_t number = found.field->number;
    problem.column = problem.found.offset +
                     (plan_.readsCsv ? offsetInCsv(piece_->text(found.row),
                                                   columns_[number - (number == 0 ? 0 : 1)])
                                     : found.field->field.first);
    problem.field = number;
    problem.name = found.field->field.name;
  } else {
    problem.column = problem.kind == NLS2F_INVALID_CSV ? problem.found.offset : -1;
  }
  return problem;
}

// Notes one thing that was found in a record. False if it ends the run.
bool RecordTranslator::note(const Found &each, bool isNew, PieceOutput &out) {
  const bool rejects = options_.onError == OnError::reject;
  const bool fails = each.replaced == 0;
  Tally &tally = out.tally;
  const Problem problem = problemOf(each);
  ++tally.kinds[kindName(problem.kind)];
  if (options_.problems && tally.lines++ < options_.problemsLimit) {
    out.problems.append(lineOf(problem, !fails ? "replaced" : rejects ? "rejected" : "failed"));
  }
  if (fails && !rejects) {
    tally.failure = problem;
    rows_ = each.row;
    return false;
  }
  tally.first = tally.first ? tally.first : problem;
  tally.replaced += static_cast<uint64_t>(each.replaced);
  tally.replacedRecords += !fails && isNew ? 1 : 0;
  if (dropped_[each.row] == 1) {
    dropped_[each.row] = 2;
    out.rejects.append(piece_->wholeOf(each.row));
    ++tally.rejected;
  }
  return true;
}

// Counts the records, and what was found in them, in the order of the input.
void RecordTranslator::report(PieceOutput &out) {
  std::stable_sort(found_.begin(), found_.end(),
                   [](const Found &a, const Found &b) { return a.row < b.row; });
  std::size_t last = SIZE_MAX; // the row before, if it had a problem
  for (const Found &each : found_) {
    if (each.row >= rows_ || !note(each, each.row != last, out)) {
      break;
    }
    last = each.row;
  }
  out.tally.records = rows_;
  for (std::size_t row = 0; row < rows_; ++row) {
    out.tally.bytesIn += static_cast<uint64_t>(piece_->whole[row].length);
  }
}

// What follows the last record that could be found.
void RecordTranslator::reportRest(PieceOutput &out) const {
  Problem problem;
  problem.found = *piece_->problem;
  problem.kind = problem.found.kind;
  problem.record = piece_->number;
  problem.byte = piece_->offset;
  problem.column = -1;
  const std::string_view rest = piece_->bytes.bytes();
  problem.words =
      problem.kind == NLS2F_CUT_SHORT && problem.found.needed != 0
          ? fmt::format("the input ends after {} of {} bytes", rest.size(), problem.found.needed)
          : wordsOf(problem.found);
  const bool isRejected = options_.onError == OnError::reject && problem.kind == NLS2F_CUT_SHORT;
  Tally &tally = out.tally;
  ++tally.kinds[kindName(problem.kind)];
  (isRejected ? tally.first : tally.failure) = problem;
  if (options_.problems) {
    out.problems.append(lineOf(problem, isRejected ? "rejected" : "failed"));
    ++tally.lines;
  }
  if (isRejected) {
    out.rejects.append(rest);
    tally.records = tally.rejected = 1;
    tally.bytesIn = rest.size();
  }
}

} // namespace nls2::tool
