// NLS2F_NumberColumn: one number of many records, as texts or 64-bit integers.
#include "facts.h"
#include "numbers/number.h"

namespace zelfields {
namespace {

bool isColumn(const NLS2F_Column &column) {
  const bool isInteger = column.offsetBits == 0;
  const bool isText = column.offsetBits == 32 || column.offsetBits == 64;
  return column.rows >= 0 && column.stride >= 0 && isRange(column.out, column.room) &&
         (isInteger || (isText && column.offsets != nullptr)) &&
         isRange(column.fields, column.rows);
}

// The end of the last row done.
void putOffset(const NLS2F_Column &column, int64_t offset) {
  if (column.offsetBits == 32) {
    static_cast<int32_t *>(column.offsets)[column.done] = static_cast<int32_t>(offset);
  } else if (column.offsetBits == 64) {
    static_cast<int64_t *>(column.offsets)[column.done] = offset;
  }
}

void putBit(const NLS2F_Column &column, bool isGood) {
  uint8_t &byte = column.good[column.done / 8];
  const auto bit = static_cast<unsigned>(column.done % 8);
  byte = static_cast<uint8_t>((bit != 0 ? byte : 0U) | ((isGood ? 1U : 0U) << bit));
}

// A row's bytes in the column.
struct Row {
  char bytes[Number::longestText];
  int64_t length = 0;
  bool isNull = false; // an integer that is not there
};

NumberFault makeInteger(const Number &number, NumberFault fault, bool mayBeNull, Row &row) {
  int64_t value = 0;
  row.isNull = fault.kind == 0 && number.count == 0;
  if (row.isNull && !mayBeNull) {
    fault.kind = NLS2F_INVALID_NUMBER;
  } else if (fault.kind == 0 && !toInteger(number, value)) {
    fault.kind = NLS2F_TOO_LARGE;
    value = 0;
  }
  std::memcpy(row.bytes, &value, sizeof value);
  row.length = sizeof value;
  return fault;
}

int32_t fillColumn(const NLS2F_Field &field, NLS2F_Column &column, NLS2F_Problem *problem) {
  const bool hasBits = column.good != nullptr;
  const int64_t most =
      column.offsetBits == 32 ? std::min<int64_t>(column.room, INT32_MAX) : column.room;
  int64_t used = 0;
  for (putOffset(column, 0); column.done < column.rows; putOffset(column, used)) {
    const auto *bytes = static_cast<const uint8_t *>(column.fields) + column.done * column.stride;
    Number number;
    Row row;
    NumberFault fault = decodeNumber(field, bytes, number);
    if (column.offsetBits == 0) {
      fault = makeInteger(number, fault, hasBits, row);
    } else if (fault.kind == 0) {
      row.length = formatNumber(number, field.scale, row.bytes);
    }
    ProblemFacts facts{fault.kind, column.done, fault.offset, 0, fault.bytes};
    const bool isFull = row.length > most - used && (facts.kind == 0 || hasBits);
    if (isFull) {
      facts = {.kind = NLS2F_NO_ROOM, .record = column.done, .needed = used + row.length};
    }
    if (facts.kind != 0 && (isFull || !hasBits || column.failed++ == 0)) {
      setProblem(problem, facts);
    }
    if (isFull || (facts.kind != 0 && !hasBits)) {
      return NLS2F_ERR_FIELD;
    }
    if (hasBits) {
      putBit(column, facts.kind == 0 && !row.isNull);
    }
    std::copy_n(row.bytes, row.length, static_cast<char *>(column.out) + used);
    used += row.length;
    ++column.done;
  }
  return 0;
}

} // namespace
} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_NumberColumn(const NLS2F_Field *field, NLS2F_Column *column, NLS2F_Problem *problem) {
  if (!isWhole(column) || !cleared(&column->done, &column->failed, &column->replaced) ||
      !isWhole(field) || !isColumn(*column) || !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return isNumberField(*field) ? fillColumn(*field, *column, problem) : NLS2_ERR_INVALID_OPTION;
}
