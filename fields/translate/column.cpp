// NLS2F_TranslateColumn: one field of many records.
#include "guard.h"
#include "translate/translator.h"

namespace zelfields {
namespace {

bool isValid(const NLS2F_Column &column) {
  return (column.offsetBits == 32 || column.offsetBits == 64) && column.rows >= 0 &&
         column.length >= 0 && column.stride >= 0 && column.offsets != nullptr &&
         isRange(column.fields, column.rows > 0 ? column.length : 0) &&
         isRange(column.out, column.room);
}

// The end of the last row done, and so the beginning of the next one.
void putOffset(const NLS2F_Column &column, int64_t offset) {
  if (column.offsetBits == 32) {
    static_cast<int32_t *>(column.offsets)[column.done] = static_cast<int32_t>(offset);
  } else {
    static_cast<int64_t *>(column.offsets)[column.done] = offset;
  }
}

void putBit(const NLS2F_Column &column, bool isGood) {
  const auto bit = static_cast<unsigned>(column.done % 8);
  uint8_t &byte = column.good[column.done / 8];
  byte = static_cast<uint8_t>((bit != 0 ? byte : 0U) | ((isGood ? 1U : 0U) << bit));
}

// Whether more room would help.
bool isFull(const NLS2F_Problem &problem, int64_t width) {
  return problem.kind == NLS2F_NO_ROOM && (width == 0 || problem.needed <= width);
}

int32_t translateColumn(NLS2F_Translator &translator, NLS2F_Column &column,
                        NLS2F_Problem &problem) {
  const Room room = Room::of(column.out, column.room);
  const int64_t most =
      column.offsetBits == 32 ? std::min<int64_t>(room.size, INT32_MAX) : room.size;
  const char *const fields = static_cast<const char *>(column.fields);
  int64_t written = 0;
  for (putOffset(column, 0); column.done < column.rows; putOffset(column, written)) {
    const auto field = textOf(fields + column.done * column.stride, column.length);
    Done row;
    NLS2F_Problem found;
    found.size = problem.size;
    const bool isGood =
        translator.translate(field, {room.begin + written, most - written}, row, &found);
    if (!isGood) {
      row = {}; // nothing of it counts
      found.record = column.done;
      const bool full = isFull(found, translator.path.policy().width);
      found.needed += full ? written : 0;
      if (full || column.good == nullptr) {
        problem = found;
        return NLS2F_ERR_FIELD;
      }
      problem = column.failed++ == 0 ? found : problem;
    }
    if (column.good != nullptr) {
      putBit(column, isGood);
    }
    written += row.written;
    column.replaced += row.replaced;
    ++column.done;
  }
  return 0;
}

} // namespace
} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_TranslateColumn(NLS2F_Translator *translator, NLS2F_Column *column,
                              NLS2F_Problem *problem) {
  if (!isWhole(column)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  column->done = column->failed = column->replaced = 0;
  if (translator == nullptr || !isValid(*column) || (problem != nullptr && !isWhole(problem))) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  NLS2F_Problem unseen;
  unseen.size = sizeof unseen;
  const int32_t status = guarded([&] {
    return translateColumn(*translator, *column, problem != nullptr ? *problem : unseen);
  });
  if (status != 0 && status != NLS2F_ERR_FIELD) {
    column->done = column->failed = column->replaced = 0;
  }
  return status;
}
