// Numbers, layouts and records: the answers in records.cases, and columns.
#include "nls2_fields.h"
#include "support/case_file.h"

#include <gtest/gtest.h>
#include <memory>
#include <optional>
#include <vector>

namespace {

using namespace std::string_literals;
using support::Case;
using support::CaseLine;

template <auto close>
struct Closer {
  template <class Handle>
  void operator()(Handle *handle) const {
    close(handle);
  }
};
using Page = std::unique_ptr<NLS2F_Page, Closer<NLS2F_ClosePage>>;
using Layout = std::unique_ptr<NLS2F_Layout, Closer<NLS2F_CloseLayout>>;
using Reader = std::unique_ptr<NLS2F_Reader, Closer<NLS2F_CloseReader>>;
using Writer = std::unique_ptr<NLS2F_Writer, Closer<NLS2F_CloseWriter>>;

Page openPage(const char *name) {
  NLS2F_Page *page = nullptr;
  EXPECT_LE(NLS2F_OpenPageByName(name, &page), 0) << name;
  return Page(page);
}

NLS2F_Problem noProblem() {
  NLS2F_Problem problem{};
  problem.size = sizeof problem;
  return problem;
}

std::string wordsOf(const NLS2F_Problem &problem) {
  char text[256];
  EXPECT_EQ(NLS2F_DescribeProblem(nullptr, &problem, text, sizeof text), 0);
  return text;
}

// "record:offset: words", or the status.
std::string faultOf(int32_t status, const NLS2F_Problem &problem) {
  return status != NLS2F_ERR_FIELD ? std::to_string(status)
                                   : std::to_string(problem.record) + ":" +
                                         std::to_string(problem.offset) + ": " + wordsOf(problem);
}

Layout openLayout(const NLS2F_Page *page, const std::string &text, uint32_t options,
                  std::string &fault) {
  NLS2F_Layout *layout = nullptr;
  NLS2F_Problem problem = noProblem();
  const int32_t status = NLS2F_OpenLayout(text.data(), static_cast<int64_t>(text.size()), page,
                                          options, &layout, &problem);
  fault = status == 0 ? "" : faultOf(status, problem);
  return Layout(layout);
}

NLS2F_Field fieldOf(const NLS2F_Layout *layout, int64_t index) {
  NLS2F_Field field{};
  field.size = sizeof field;
  EXPECT_EQ(NLS2F_LayoutField(layout, index, &field), 0);
  return field;
}

std::string textOf(const NLS2F_Field &field, const std::string &bytes) {
  char text[34];
  int64_t written = 0;
  NLS2F_Problem problem = noProblem();
  const int32_t status =
      NLS2F_NumberToText(&field, bytes.data(), text, sizeof text, &written, &problem);
  return status == 0 ? std::string(text, static_cast<std::size_t>(written))
                     : faultOf(status, problem);
}

std::string bytesOf(const NLS2F_Field &field, const std::string &text) {
  std::string bytes(static_cast<std::size_t>(field.length), '?');
  NLS2F_Problem problem = noProblem();
  const int32_t status = NLS2F_TextToNumber(&field, text.data(), static_cast<int64_t>(text.size()),
                                            bytes.data(), &problem);
  return status == 0 ? bytes : faultOf(status, problem);
}

// The record's length, and of each field "name@first+length kind.scale/options page".
std::string factsOf(const NLS2F_Layout *layout) {
  int64_t count = 0;
  int64_t length = 0;
  EXPECT_EQ(NLS2F_LayoutSize(layout, &count, &length), 0);
  std::string facts = std::to_string(length) + ":";
  for (int64_t i = 0; i < count; ++i) {
    const NLS2F_Field field = fieldOf(layout, i);
    facts += " "s + field.name + "@" + std::to_string(field.first) + "+" +
             std::to_string(field.length) + " " + std::to_string(field.kind) + "." +
             std::to_string(field.scale) + "/" + std::to_string(field.options) +
             (field.page != nullptr ? " "s + field.page : "") + ";";
  }
  return facts;
}

// The records, a line each, and the text's page if it is not the one given; then the fault. Pieces
// grow by a byte, or are all of the input.
std::string readAll(const std::string &format, const NLS2F_Page *page, const std::string &input,
                    bool isWhole) {
  NLS2F_Reader *opened = nullptr;
  NLS2F_Problem problem = noProblem();
  int32_t status = NLS2F_OpenReader(format.c_str(), page, &opened, &problem);
  const Reader reader(opened);
  std::string answer;
  int64_t count = 1;
  std::size_t at = 0;
  std::size_t end = isWhole ? input.size() : 0;
  while (status == 0 && (count != 0 || end < input.size())) {
    NLS2F_Span spans[2];
    int64_t read = 0;
    end = count == 0 ? end + 1 : end;
    const std::vector<char> piece(input.begin() + static_cast<std::ptrdiff_t>(at),
                                  input.begin() + static_cast<std::ptrdiff_t>(end));
    status = NLS2F_ReadRecords(reader.get(), piece.data(), static_cast<int64_t>(piece.size()),
                               end == input.size(), &read, spans, 2, &count, &problem);
    for (int64_t i = 0; i < count; ++i) {
      answer.append(piece.data() + spans[i].offset, static_cast<std::size_t>(spans[i].length));
      answer += '/';
    }
    at += static_cast<std::size_t>(read);
  }
  const char *name = "";
  if (opened != nullptr) {
    NLS2F_ReaderPage(opened, &name);
  }
  const bool isChosen = std::string_view(name).starts_with("UTF-16");
  return answer + (isChosen ? name : "") + (status != 0 ? faultOf(status, problem) : "");
}

std::vector<NLS2F_Span> spansOf(const std::string &texts) {
  std::vector<NLS2F_Span> spans;
  for (std::size_t at = 0, end; (end = texts.find('/', at)) != texts.npos; at = end + 1) {
    spans.push_back({static_cast<int64_t>(at), static_cast<int64_t>(end - at)});
  }
  return spans;
}

std::string writeAll(const std::string &format, const NLS2F_Page *page, const std::string &texts) {
  NLS2F_Writer *opened = nullptr;
  NLS2F_Problem problem = noProblem();
  int32_t status = NLS2F_OpenWriter(format.c_str(), page, &opened, &problem);
  const Writer writer(opened);
  const auto spans = spansOf(texts);
  std::string out(100, '?');
  int64_t written = 0;
  int64_t done = 0;
  if (status == 0) {
    status = NLS2F_WriteRecords(opened, texts.data(), spans.data(), std::ssize(spans), out.data(),
                                20, &written, &done, &problem);
  }
  return out.substr(0, static_cast<std::size_t>(written)) +
         (status != 0 ? faultOf(status, problem) : "");
}

std::string split(const std::string &record) {
  std::string out(record.size(), '?');
  NLS2F_Span fields[4];
  int64_t count = 0;
  NLS2F_Problem problem = noProblem();
  const int32_t status =
      NLS2F_SplitCsv(record.data(), std::ssize(record), out.data(), fields, 4, &count, &problem);
  std::string answer = status != 0 ? faultOf(status, problem) : "";
  for (int64_t i = 0; i < std::min<int64_t>(count, 4); ++i) {
    answer += out.substr(static_cast<std::size_t>(fields[i].offset),
                         static_cast<std::size_t>(fields[i].length)) +
              "/";
  }
  return answer;
}

std::string join(const std::string &texts) {
  const auto fields = spansOf(texts);
  std::string out(100, '?');
  int64_t written = 0;
  EXPECT_EQ(NLS2F_JoinCsv(texts.data(), fields.data(), std::ssize(fields), out.data(), 100,
                          &written, nullptr),
            0);
  return out.substr(0, static_cast<std::size_t>(written));
}

// Of two texts: the order without trailing blanks, or where the second occurs, without case.
std::string collate(bool finds, const std::string &locale, const NLS2F_Page *page,
                    const std::string &texts) {
  NLS2F_Collator *opened = nullptr;
  const uint32_t option = finds ? uint32_t{IGNORECASE} : uint32_t{SORT_IGNORETRAILING};
  EXPECT_LE(NLS2F_OpenCollator(locale.c_str(), page, option, &opened), 0);
  const std::unique_ptr<NLS2F_Collator, Closer<NLS2F_CloseCollator>> collator(opened);
  const auto spans = spansOf(texts);
  const char *const second = texts.data() + spans.at(1).offset;
  int32_t order = 0;
  int64_t at = 0;
  int64_t length = 0;
  EXPECT_EQ(
      finds
          ? NLS2F_Find(opened, texts.data(), spans[0].length, second, spans[1].length, &at, &length)
          : NLS2F_Compare(opened, texts.data(), spans[0].length, second, spans[1].length, &order),
      0);
  return finds ? std::to_string(at) + "+" + std::to_string(length) : std::to_string(order);
}

std::string answerOf(const std::string &key, const NLS2F_Page *page, const std::string &how,
                     const std::string &given) {
  std::string fault;
  if (key == "from" || key == "to") {
    const Layout layout = openLayout(page, "n " + how, 0, fault);
    const NLS2F_Field field = fieldOf(layout.get(), 0);
    return fault + (key == "from" ? textOf(field, given) : bytesOf(field, given));
  }
  if (key == "read" || key == "whole") {
    const std::string answer = readAll(how, page, given, true);
    EXPECT_TRUE(key == "whole" || readAll(how, page, given, false) == answer) << answer;
    return answer;
  }
  if (key == "find" || key == "order") {
    return collate(key == "find", how, page, given);
  }
  if (key == "write") {
    return writeAll(how, page, given);
  }
  if (key == "split" || key == "join") {
    return key == "split" ? split(given) : join(given);
  }
  const uint32_t options = key == "short"    ? NLS2F_LAYOUT_SHORT
                           : key == "writes" ? NLS2F_LAYOUT_WRITES
                                             : 0;
  const Layout layout = openLayout(page, given, options, fault);
  return layout ? factsOf(layout.get()) : fault;
}

TEST(Records, AnswerAsTheFileHasThem) {
  for (const Case &test :
       support::readCases(CASES_FOLDER "/fields/records.cases",
                          {"page", "both", "from", "to", "layout", "short", "writes", "read",
                           "whole", "write", "split", "join", "find", "order"})) {
    Page page;
    for (const CaseLine &line : test.lines) {
      SCOPED_TRACE(line.place + " " + line.value);
      if (line.key == "page") {
        page = openPage(line.value.c_str());
        continue;
      }
      const auto bytesIn = [&](const std::string &part) {
        return part == "''" ? "" : CaseLine{line.key, part, line.place}.bytes();
      };
      auto [how, rest] = line.split(" | ");
      std::string given = bytesIn(how);
      if (rest.value.find(" | ") != std::string::npos) {
        const auto [middle, answer] = rest.split(" | ");
        given = bytesIn(middle);
        rest = answer;
      }
      const std::string answer = bytesIn(rest.value);
      const bool goesBoth = line.key == "both";
      EXPECT_EQ(answerOf(goesBoth ? "from" : line.key, page.get(), how, given), answer);
      EXPECT_TRUE(!goesBoth || answerOf("to", page.get(), how, answer) == given);
    }
  }
}

TEST(Numbers, InColumnsAreTextsOrIntegers) {
  std::string fault;
  const Layout layout = openLayout(openPage("37").get(), "n 2 packed.1 blank=empty", 0, fault);
  const NLS2F_Field field = fieldOf(layout.get(), 0);
  const std::string bytes = "\x12\x3C\x40\x40\xFF\xFF\x00\x5D"s;
  std::vector<int64_t> values(4);
  std::vector<int32_t> offsets(5);
  char texts[16];
  uint8_t good = 0xFF;
  NLS2F_Problem problem = noProblem();
  NLS2F_Column column{};
  column.size = sizeof column;
  column.fields = bytes.data();
  column.stride = 2;
  column.rows = 4;
  column.out = values.data();
  column.room = 32;
  column.good = &good;
  EXPECT_EQ(NLS2F_NumberColumn(&field, &column, &problem), 0);
  EXPECT_EQ(values, (std::vector<int64_t>{123, 0, 0, -5}));
  EXPECT_TRUE(good == 0b1001 && column.done == 4 && column.failed == 1 && problem.record == 2);
  column.offsetBits = 32;
  column.offsets = offsets.data();
  column.out = texts;
  column.room = 7; // a byte less than all
  EXPECT_EQ(NLS2F_NumberColumn(&field, &column, &problem), NLS2F_ERR_FIELD);
  EXPECT_TRUE(column.done == 3 && good == 0b011 && problem.needed == 8 && problem.record == 3);
  column.room = 8;
  EXPECT_EQ(NLS2F_NumberColumn(&field, &column, &problem), 0);
  EXPECT_EQ(offsets, (std::vector<int32_t>{0, 4, 4, 4, 8}));
  EXPECT_EQ(std::string(texts, 8), "12.3-0.5");
}

} // namespace
