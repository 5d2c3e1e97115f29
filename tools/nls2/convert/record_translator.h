// A piece of records from one form to another.
#pragma once

#include "convert/field_translator.h"
#include "convert/problem.h"
#include "text/record_source.h"

namespace nls2::tool {

// Of CSV that is read: which of its columns each field is.
using CsvColumns = std::vector<std::size_t>;

// What becomes of a piece.
struct PieceOutput {
  ByteBuffer bytes;
  ByteBuffer rejects;
  ByteBuffer problems; // lines of JSON
  Tally tally;
};

// Keeps its translators open: every worker has one.
class RecordTranslator {
public:
  // Throws usageError.
  RecordTranslator(const TranslateOptions &options, const Plan &plan, const CsvColumns &columns);

  // The records up to the first one that ends the run, if there is one.
  void translate(const RecordPiece &piece, PieceOutput &out);

private:
  struct Found {
    std::size_t row;
    const FieldPlan *field; // null: the whole record
    FieldFault fault;
    int64_t replaced; // 0: the record failed
  };

  void translateColumn(std::size_t field);
  void translateSplit(std::size_t row);
  void translateOne(std::size_t row, std::size_t field, std::string_view source);
  void verify(std::size_t row, std::size_t field, std::string_view source);
  void add(std::size_t row, const FieldPlan *field, FieldFault fault, int64_t replaced = 0);
  NLS2F_Span &value(std::size_t row, std::size_t field) {
    return values_[row * fields_.size() + field];
  }
  void assemble(std::size_t row);
  void write(PieceOutput &out);
  Problem problemOf(const Found &found) const;
  bool note(const Found &each, bool isNew, PieceOutput &out);
  void report(PieceOutput &out);
  void reportRest(PieceOutput &out) const;

  const TranslateOptions &options_;
  const Plan &plan_;
  const CsvColumns &columns_;
  std::vector<FieldTranslator> fields_;
  Writer writer_;
  std::string empty_; // a record of blanks; empty if there is no layout to fill
  Translators open_;

  const RecordPiece *piece_ = nullptr;
  std::size_t rows_ = 0;           // of the piece, up to the first that ends the run
  ByteBuffer bytes_;               // of all values
  std::vector<NLS2F_Span> values_; // by row and field
  std::vector<uint8_t> dropped_;   // by row
  std::vector<Found> found_;
  ByteBuffer gathered_; // one field of all records
  ByteBuffer records_;  // as they are written, without ends and prefixes
  ByteBuffer split_;
  std::vector<NLS2F_Span> column_;
  std::vector<uint8_t> good_;
};

} // namespace nls2::tool
