// Opens and closes writers, and writes records; NLS2F_GatherFields.
#include "pages/character_bytes.h"
#include "records/format.h"

#include <cstring>
#include <memory>

struct NLS2F_Writer {
  zelfields::RecordFormat format;
  std::string blank; // fixed
  std::string end;   // lines, csv
};

namespace zelfields {
namespace {

using Kind = RecordFormat::Kind;
using End = RecordFormat::End;

constexpr int64_t prefixSize = 4;
constexpr int64_t longestCounted = 0xFFFF;

bool prepare(const NLS2F_Page *page, NLS2F_Writer &writer, ProblemFacts &fault) {
  const RecordFormat &format = writer.format;
  if (format.kind == Kind::blocked) {
    return failFormat(fault, Detail::onlyRead);
  }
  if (format.kind == Kind::csv) {
    writer.end = format.end == End::crlf ? "\r\n" : "\n";
  }
  if (format.kind != Kind::fixed && format.kind != Kind::lines) {
    return true;
  }
  if (page == nullptr) {
    return failFormat(fault, Detail::needsPage);
  }
  if (format.kind == Kind::fixed) {
    writer.blank = bytesOf(*page, u' ');
    return !writer.blank.empty() || failFormat(fault, Detail::noBlank);
  }
  LineEnds ends;
  if (page->hasSignature) {
    return failFormat(fault, Detail::signature);
  }
  if (!findLineEnds(*page, format.end, ends, fault)) {
    return false;
  }
  writer.end = ends.main;
  return true;
}

// The most bytes of a record.
int64_t limitOf(const RecordFormat &format) {
  return format.kind == Kind::fixed      ? format.length
         : format.kind != Kind::prefixed ? INT64_MAX / 2
         : format.dataOnly               ? longestCounted
                                         : longestCounted - prefixSize;
}

// The bytes that come of a record, or a problem.
int64_t sizeOf(const NLS2F_Writer &writer, int64_t length, ProblemFacts &fault) {
  const RecordFormat &format = writer.format;
  if (const int64_t limit = limitOf(format); length > limit) {
    fault = {.kind = NLS2F_RECORD_TOO_LONG, .offset = limit, .needed = limit};
  } else if (format.kind == Kind::fixed) {
    const auto blank = static_cast<int64_t>(writer.blank.size());
    if (const int64_t over = (limit - length) % blank; over != 0) {
      fault = {.kind = NLS2F_NO_EXACT_FILL, .offset = length, .needed = limit - over};
    }
    return limit;
  }
  return length +
         (format.kind == Kind::prefixed ? prefixSize : static_cast<int64_t>(writer.end.size()));
}

void write(const NLS2F_Writer &writer, std::string_view record, int64_t size, char *out) {
  const RecordFormat &format = writer.format;
  char *const end = out + size;
  if (format.kind == Kind::prefixed) {
    const auto counted = record.size() + (format.dataOnly ? 0 : prefixSize);
    out[format.little ? 1 : 0] = static_cast<char>(counted >> 8);
    out[format.little ? 0 : 1] = static_cast<char>(counted);
    out[2] = out[3] = 0;
    out += prefixSize;
  }
  if (!record.empty()) {
    std::memcpy(out, record.data(), record.size());
  }
  out += record.size();
  if (format.kind == Kind::fixed) {
    for (; out < end; out += writer.blank.size()) {
      std::memcpy(out, writer.blank.data(), writer.blank.size());
    }
  } else if (out < end) {
    std::memcpy(out, writer.end.data(), writer.end.size());
  }
}

} // namespace
} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_OpenWriter(const char *format, const NLS2F_Page *page, NLS2F_Writer **writer,
                         NLS2F_Problem *problem) {
  if (!cleared(writer) || format == nullptr || !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return guarded([&]() -> int32_t {
    auto made = std::make_unique<NLS2F_Writer>();
    ProblemFacts fault;
    if (!parseFormat(format, made->format, fault) || !prepare(page, *made, fault)) {
      return setProblem(problem, fault);
    }
    *writer = made.release();
    return 0;
  });
}

void NLS2F_CloseWriter(NLS2F_Writer *writer) { delete writer; }

int32_t NLS2F_WriteRecords(const NLS2F_Writer *writer, const void *bytes, const NLS2F_Span *records,
                           int64_t count, void *out, int64_t room, int64_t *written, int64_t *done,
                           NLS2F_Problem *problem) {
  if (!cleared(written, done) || writer == nullptr || !isRange(records, count) ||
      !isRange(out, room) || !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  for (; *done < count; ++*done) {
    if (!isSpan(bytes, records[*done])) {
      return NLS2_ERR_INVALID_PARAMETER;
    }
    const std::string_view record = spanOf(bytes, records[*done]);
    ProblemFacts fault;
    const int64_t size = sizeOf(*writer, static_cast<int64_t>(record.size()), fault);
    if (fault.kind == 0 && size > room - *written) {
      fault = {.kind = NLS2F_NO_ROOM, .needed = *written + size};
    }
    if (fault.kind != 0) {
      fault.record = *done;
      return setProblem(problem, fault);
    }
    write(*writer, record, size, static_cast<char *>(out) + *written);
    *written += size;
  }
  return 0;
}

int32_t NLS2F_GatherFields(const NLS2F_Field *field, const void *bytes, const NLS2F_Span *records,
                           int64_t count, void *fields) {
  if (!isWhole(field) || field->first < 0 || field->length < 0 || !isRange(records, count) ||
      (count > 0 && field->length > 0 && fields == nullptr)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  auto *out = static_cast<char *>(fields);
  const auto length = static_cast<std::size_t>(field->length);
  for (int64_t i = 0; i < count && length != 0; ++i, out += length) {
    if (!isSpan(bytes, records[i])) {
      return NLS2_ERR_INVALID_PARAMETER;
    }
    const std::string_view record = spanOf(bytes, records[i]);
    const std::size_t first = std::min(static_cast<std::size_t>(field->first), record.size());
    const std::string_view part = record.substr(first, length);
    const std::size_t copied = part.copy(out, length);
    std::memset(out + copied, field->blank, length - copied);
  }
  return 0;
}
