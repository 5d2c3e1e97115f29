// NLS2F_NumberColumn: one number of many records, as texts or 64-bit integers.
#include "guard.h"
#include "numbers/number.h"
#include "problem.h"

#include <cstring>

namespace zelfields {
namespace {

bool isColumn(const NLS2F_Column *column) {
  if (!isWhole(column) || column->rows < 0 || column->stride < 0 ||
      !isRange(column->out, column->room)) {
    return false;
  }
  const bool hasOffsets = column->offsetBits == 32 || column->offsetBits == 64;
  return (column->offsetBits == 0 || (hasOffsets && column->offsets != nullptr)) &&
         (column->rows == 0 || column->fields != nullptr);
}

// Puts rows after those that are done.
class ColumnOutput {
public:
  explicit ColumnOutput(NLS2F_Column &column) : column_(column) {
    column.done = column.failed = column.replaced = 0;
    putOffset();
  }

  bool isIntegers() const { return column_.offsetBits == 0; }

  // The room that the next row takes.
  int64_t needed(int64_t length) const { return used_ + length; }
  bool fits(int64_t length) const {
    return needed(length) <= column_.room &&
           (column_.offsetBits != 32 || needed(length) <= INT32_MAX);
  }

  void put(const void *bytes, int64_t length, bool isGood) {
    if (length != 0) {
      std::memcpy(static_cast<char *>(column_.out) + used_, bytes,
                  static_cast<std::size_t>(length));
    }
    used_ += length;
    if (column_.good != nullptr) {
      uint8_t &byte = column_.good[column_.done / 8];
      const int bit = static_cast<int>(column_.done % 8);
      byte = static_cast<uint8_t>((bit == 0 ? 0 : byte) | (isGood ? 1 << bit : 0));
    }
    ++column_.done;
    putOffset();
  }

private:
  void putOffset() {
    auto *offsets = static_cast<char *>(column_.offsets);
    const auto row = static_cast<std::size_t>(column_.done);
    if (column_.offsetBits == 32) {
      const auto offset = static_cast<int32_t>(used_);
      std::memcpy(offsets + row * sizeof offset, &offset, sizeof offset);
    } else if (column_.offsetBits == 64) {
      std::memcpy(offsets + row * sizeof used_, &used_, sizeof used_);
    }
  }

  NLS2F_Column &column_;
  int64_t used_ = 0;
};

// A row's bytes in the output: a text or an integer.
struct Row {
  char bytes[Number::longestText];
  int64_t length = 0;
  bool isGood = true;
};

NumberFault makeRow(const NLS2F_Field &field, const uint8_t *bytes, bool isInteger, bool mayBeEmpty,
                    Row &row) {
  Number number;
  NumberFault fault = decodeNumber(field, bytes, number);
  if (!isInteger) {
    row.length = fault.kind == 0 ? formatNumber(number, field.scale, row.bytes) : 0;
    return fault;
  }
  int64_t value = 0;
  if (fault.kind == 0 && !toInteger(number, value)) {
    fault.kind = NLS2F_TOO_LARGE;
  } else if (fault.kind == 0 && number.count == 0) {
    row.isGood = false;
    fault.kind = mayBeEmpty ? 0 : NLS2F_INVALID_NUMBER;
  }
  value = fault.kind == 0 ? value : 0;
  std::memcpy(row.bytes, &value, sizeof value);
  row.length = sizeof value;
  return fault;
}

int32_t fillColumn(const NLS2F_Field &field, NLS2F_Column &column, NLS2F_Problem *problem) {
  ColumnOutput output(column);
  const bool keepsOn = column.good != nullptr;
  const auto *bytes = static_cast<const uint8_t *>(column.fields);
  for (int64_t i = 0; i < column.rows; ++i) {
    Row row;
    const NumberFault fault =
        makeRow(field, bytes + i * column.stride, output.isIntegers(), keepsOn, row);
    if (fault.kind == 0 || keepsOn) {
      if (!output.fits(row.length)) {
        return setProblem(
            problem, {.kind = NLS2F_NO_ROOM, .record = i, .needed = output.needed(row.length)});
      }
      output.put(row.bytes, row.length, row.isGood && fault.kind == 0);
    }
    if (fault.kind != 0) {
      if (!keepsOn || column.failed++ == 0) {
        setProblem(problem,
                   {.kind = fault.kind, .record = i, .offset = fault.offset, .bytes = fault.bytes});
      }
      if (!keepsOn) {
        return NLS2F_ERR_FIELD;
      }
    }
  }
  return 0;
}

} // namespace
} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_NumberColumn(const NLS2F_Field *field, NLS2F_Column *column, NLS2F_Problem *problem) {
  if (!isWhole(field) || !isColumn(column) || !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return isNumberField(*field) ? fillColumn(*field, *column, problem) : NLS2_ERR_INVALID_OPTION;
}
