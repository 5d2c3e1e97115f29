// Records come back from every format as they were written, however the input is cut into pieces;
// and of any bytes all cuts find the same records and the same problem.

#include "nls2_fields.h"
#include "property.h"

#include <vector>

namespace {

using property::check;
using property::exact;
using property::Input;
using property::Output;
using Texts = std::vector<std::string>;

struct Format {
  const char *write, *read, *page;
  const char *ends[3]; // what a record cannot have
};
constexpr Format formats[] = {
    {"fixed:6", "fixed:6", "utf-16le", {}},
    {"prefixed", "prefixed", "ibm-37", {}},
    {"prefixed:data", "prefixed:data", "ibm-37", {}},
    {"prefixed:little", "prefixed:little", "ibm-37", {}},
    {"prefixed:little:data", "prefixed:data:little", "ibm-37", {}},
    {"lines", "lines", "ibm-1047", {"\x25", "\x15", "\x0D"}},
    {"lines:nel", "lines", "utf-8", {"\n", "\r", "\xC2\x85"}},
    {"lines:crlf", "lines:crlf", "utf-8", {"\r\n"}},
    {"lines:lf", "lines:lf", "utf-16be", {"\n"}},
    {"csv", "csv:crlf", "utf-8", {}},
    {"csv:crlf", "csv", "utf-8", {}},
    {"", "blocked", "ibm-37", {}},
};

NLS2F_Page *pageOf(const char *name) {
  NLS2F_Page *page = nullptr;
  check(NLS2F_OpenPageByName(name, &page) <= 0, "a page opens");
  return page;
}

std::string join(const Texts &texts, std::vector<NLS2F_Span> &spans) {
  std::string bytes;
  for (const std::string &text : texts) {
    spans.push_back({std::ssize(bytes), std::ssize(text)});
    bytes += text;
  }
  return bytes;
}

std::string csvOf(const Texts &fields) {
  std::vector<NLS2F_Span> spans;
  const std::string bytes = join(fields, spans);
  NLS2F_Problem problem{};
  problem.size = sizeof problem;
  int64_t written = 0;
  check(NLS2F_JoinCsv(bytes.data(), spans.data(), std::ssize(spans), nullptr, 0, &written,
                      &problem) == (problem.needed != 0 ? NLS2F_ERR_FIELD : 0),
        "room for CSV");
  const Output<char> out(static_cast<size_t>(problem.needed));
  check(NLS2F_JoinCsv(bytes.data(), spans.data(), std::ssize(spans), out.get(), problem.needed,
                      &written, &problem) == 0,
        "CSV is written");
  return {out.get(), static_cast<size_t>(written)};
}

Texts fieldsOf(const std::string &record) {
  const Output<char> out(record.size());
  std::vector<NLS2F_Span> spans(record.size() + 1);
  int64_t count = 0;
  check(NLS2F_SplitCsv(exact(record).get(), std::ssize(record), out.get(), spans.data(),
                       std::ssize(spans), &count, nullptr) == 0,
        "CSV is split");
  Texts fields;
  for (int64_t i = 0; i < count; ++i) {
    const NLS2F_Span &span = spans[static_cast<size_t>(i)];
    fields.emplace_back(out.get() + span.offset, static_cast<size_t>(span.length));
  }
  return fields;
}

// Any record is split, or has a place that is wrong.
void splitAny(const std::string &record) {
  const Output<char> out(record.size());
  NLS2F_Problem problem{};
  problem.size = sizeof problem;
  int64_t count = 0;
  const int32_t status = NLS2F_SplitCsv(exact(record).get(), std::ssize(record), out.get(), nullptr,
                                        0, &count, &problem);
  check(status == U_BUFFER_OVERFLOW_ERROR
            ? count > 0
            : status == NLS2F_ERR_FIELD && problem.offset < std::ssize(record),
        "any record is split or refused");
}

// What a reader finds, with the problem at the end.
struct Answer {
  Texts records;
  int32_t status = 0;
  int64_t record = 0, offset = 0;
  bool operator==(const Answer &) const = default;
};

Answer read(Input &input, const Format &format, const std::string &bytes, bool isWhole) {
  NLS2F_Page *const page = pageOf(format.page);
  NLS2F_Reader *reader = nullptr;
  NLS2F_Problem problem{};
  problem.size = sizeof problem;
  check(NLS2F_OpenReader(format.read, page, &reader, &problem) == 0, "a reader opens");
  NLS2F_ClosePage(page);
  Answer answer;
  size_t at = 0;
  size_t end = isWhole ? bytes.size() : 0;
  for (int64_t count = 1; answer.status == 0 && (count != 0 || end < bytes.size());) {
    end = count == 0 ? end + 1 + input.below(bytes.size() - end) : end;
    const std::string piece = bytes.substr(at, end - at);
    std::vector<NLS2F_Span> spans(isWhole ? bytes.size() + 1 : 1 + input.below(3));
    int64_t taken = 0;
    answer.status =
        NLS2F_ReadRecords(reader, exact(piece).get(), std::ssize(piece), end == bytes.size(),
                          &taken, spans.data(), std::ssize(spans), &count, &problem);
    for (int64_t i = 0; i < count; ++i) {
      const NLS2F_Span &span = spans[static_cast<size_t>(i)];
      check(span.offset >= 0 && span.offset + span.length <= taken, "a record is in what is read");
      answer.records.push_back(
          piece.substr(static_cast<size_t>(span.offset), static_cast<size_t>(span.length)));
    }
    at += static_cast<size_t>(taken);
  }
  NLS2F_CloseReader(reader);
  answer.record = problem.record;
  answer.offset = problem.offset;
  return answer;
}

std::string write(const Format &format, const Texts &records) {
  NLS2F_Page *const page = pageOf(format.page);
  NLS2F_Writer *writer = nullptr;
  check(NLS2F_OpenWriter(format.write, page, &writer, nullptr) == 0, "a writer opens");
  NLS2F_ClosePage(page);
  std::vector<NLS2F_Span> spans;
  const std::string bytes = join(records, spans);
  std::string out;
  NLS2F_Problem problem{};
  problem.size = sizeof problem;
  int64_t done = 0;
  for (int32_t status = NLS2F_ERR_FIELD; status != 0;) { // with room for one more record each time
    const Output<char> room(static_cast<size_t>(problem.needed));
    int64_t written = 0;
    int64_t count = 0;
    status = NLS2F_WriteRecords(writer, exact(bytes).get(), spans.data() + done,
                                std::ssize(spans) - done, room.get(), problem.needed, &written,
                                &count, &problem);
    check(status == 0 || problem.kind == NLS2F_NO_ROOM, "records are written");
    out.append(room.get(), static_cast<size_t>(written));
    done += count;
  }
  NLS2F_CloseWriter(writer);
  return out;
}

// A record that the format can hold: without line ends, or of the length that it has.
std::string recordFrom(Input &input, const Format &format) {
  constexpr char bytes[] = "a\x25\x15\x0D\n\r\xC2\x85\xFE\xFF\0,\"";
  std::string record;
  for (size_t length = input.below(9); length > 0; --length) {
    record += bytes[input.below(sizeof bytes)];
  }
  for (const char *end : format.ends) {
    for (size_t at; end != nullptr && (at = record.find(end)) != record.npos;) {
      record.erase(at, std::string_view(end).size());
    }
  }
  if (std::string_view(format.page).starts_with("utf-16")) {
    record.resize(std::string_view(format.write) == "fixed:6" ? 6 : record.size() / 2 * 2, 'x');
    record[0] = record.starts_with("\xFE\xFF") ? 'x' : record[0]; // no mark
  }
  return record;
}

} // namespace

int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  Input input(data, size);
  const Format format = input.oneOf(formats);
  Texts records;
  std::vector<Texts> rows;
  for (size_t count = input.below(6); count > 0; --count) {
    if (std::string_view(format.page) != "utf-8" || format.ends[0] != nullptr) {
      records.push_back(recordFrom(input, format));
      continue;
    }
    rows.emplace_back(1 + input.below(3));
    for (std::string &field : rows.back()) {
      field = recordFrom(input, format);
    }
    records.push_back(csvOf(rows.back()));
    check(fieldsOf(records.back()) == rows.back(), "the fields of CSV come back");
  }
  if (*format.write != '\0') {
    const std::string written = write(format, records);
    for (const bool isWhole : {true, false}) {
      check(read(input, format, written, isWhole).records == records, "records come back");
    }
  }
  const std::string any = input.bytes(SIZE_MAX);
  const Answer whole = read(input, format, any, true);
  check(whole == read(input, format, any, false), "all cuts agree");
  for (const std::string &record : whole.records) {
    splitAny(record);
  }
  return 0;
}
