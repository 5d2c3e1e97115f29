// Translators: tables against the path, columns against fields, and texts in pieces against whole ones.

#include "property.h"
#include "translate/translator.h"

#include <cstring>
#include <map>
#include <vector>

namespace {

using property::check;

struct Answer {
  int32_t status = 0;
  int64_t written = 0;
  int64_t replaced = 0;
  NLS2F_Problem problem = {};
  std::string bytes;

  bool operator==(const Answer &other) const {
    return status == other.status && replaced == other.replaced && bytes == other.bytes &&
           std::memcmp(&problem, &other.problem, sizeof problem) == 0;
  }
};

NLS2F_Page *openPage(property::Input &input, const char *&name) {
  static auto &opened = *new std::map<int64_t, NLS2F_Page *>; // open until the process ends
  int64_t count = 0;
  NLS2F_PageCount(&count);
  const auto index = static_cast<int64_t>(input.below(static_cast<size_t>(count)));
  check(NLS2F_PageAt(index, &name) == 0 &&
            (opened[index] != nullptr || NLS2F_OpenPageByName(name, &opened[index]) <= 0),
        "every page of the list opens");
  return opened[index];
}

Answer translate(NLS2F_Translator *with, const std::string &field, int64_t room) {
  Answer answer;
  answer.problem.size = sizeof answer.problem;
  const auto source = property::exact(field);
  const property::Output<char> out(static_cast<size_t>(room));
  answer.status = NLS2F_Translate(with, source.get(), std::ssize(field), out.get(), room,
                                  &answer.written, &answer.replaced, &answer.problem);
  answer.bytes.assign(out.get(), static_cast<size_t>(answer.written));
  return answer;
}

// The fields that begin at each byte.
void checkColumn(NLS2F_Translator *with, const std::string &fields, int64_t length, int64_t room) {
  const int64_t rows = std::max<int64_t>(std::ssize(fields) - length, 0);
  std::vector<int64_t> offsets(static_cast<size_t>(rows) + 1);
  std::vector<uint8_t> good(static_cast<size_t>(rows + 7) / 8);
  const property::Output<char> out(static_cast<size_t>(room));
  NLS2F_Column column = {sizeof column,
                         64,
                         fields.data(),
                         length,
                         1,
                         rows,
                         out.get(),
                         room,
                         offsets.data(),
                         good.data(),
                         0,
                         0,
                         0};
  NLS2F_Problem problem = {};
  problem.size = sizeof problem;
  const int32_t status = NLS2F_TranslateColumn(with, &column, &problem);
  int64_t failed = 0;
  for (int64_t row = 0; row < column.done; ++row) {
    const auto at = static_cast<size_t>(row);
    const std::string field = fields.substr(at, static_cast<size_t>(length));
    const Answer alone = translate(with, field, room - offsets[at]);
    check(std::string(out.get() + offsets[at], out.get() + offsets[at + 1]) == alone.bytes &&
              ((good[at / 8] >> at % 8 & 1) != 0) == (alone.status == 0),
          "a row is as its field alone");
    failed += alone.status == 0 ? 0 : 1;
  }
  check(column.failed == failed, "failed rows are counted");
  check(status == 0 ? column.done == rows
                    : problem.kind == NLS2F_NO_ROOM && problem.record == column.done &&
                          problem.needed > room,
        "only a lack of room stops a column");
}

void checkPieces(NLS2F_Translator *with, const std::string &text, const Answer &whole,
                 property::Input &input) {
  Answer answer;
  answer.problem.size = sizeof answer.problem;
  const size_t most = 1 + input.below(9);
  for (size_t at = 0; answer.status == 0 || answer.problem.kind == NLS2F_NO_ROOM;) {
    const std::string piece = text.substr(at, input.below(most + 1) + (input.flag() ? 0 : 1));
    const bool isLast = at + piece.size() == text.size();
    const auto source = property::exact(piece);
    const property::Output<char> out(32);
    int64_t read = 0;
    int64_t replaced = 0;
    answer.problem.kind = 0;
    answer.status = NLS2F_TranslateChunk(with, source.get(), std::ssize(piece), isLast, out.get(),
                                         32, &read, &answer.written, &replaced, &answer.problem);
    answer.bytes.append(out.get(), static_cast<size_t>(answer.written));
    answer.replaced += replaced;
    at += static_cast<size_t>(read);
    if (answer.status == 0 && isLast) {
      break;
    }
  }
  if (whole.status == 0) {
    check(answer.status == 0 && answer.bytes == whole.bytes && answer.replaced == whole.replaced,
          "the pieces are the whole");
  } else {
    check(answer.status == whole.status &&
              std::memcmp(&answer.problem, &whole.problem, sizeof whole.problem) == 0,
          "and so is their problem");
  }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  property::Input input(data, size);
  const char *name = nullptr;
  const NLS2F_Page *to = openPage(input, name);
  const NLS2F_Page *from = openPage(input, name);
  NLS2F_Policy policy = {sizeof policy, static_cast<int32_t>(input.below(4)),
                         static_cast<int32_t>(input.below(3)), 0, 0};
  policy.width =
      policy.padding == NLS2F_FILL || input.flag() ? 1 + static_cast<int64_t>(input.below(30)) : 0;
  NLS2F_Translator *fast = nullptr;
  NLS2F_Translator *slow = nullptr;
  if (NLS2F_OpenTranslator(from, to, &policy, &fast) != 0) {
    check(policy.padding == NLS2F_FILL, "only blanks can be lacking");
    return 0;
  }
  check(NLS2F_CloneTranslator(fast, &slow) == 0, "what opens can be cloned");
  slow->table.turnOff();
  // ICU does not reset compound text; of SCSU in its two-byte mode it gives places that depend on
  // the cuts.
  const UConverterType type = ucnv_getType(from->converter.getAlias());
  const bool isCut = policy.padding == NLS2F_AS_IS && policy.width == 0 &&
                     type != UCNV_COMPOUND_TEXT && type != UCNV_SCSU;
  const auto length = static_cast<int64_t>(input.below(12));
  const auto less = static_cast<int64_t>(input.below(40));
  const std::string field = input.text({0, name});
  for (int again = 0; again < 2; ++again) { // with what was learned the first time
    int64_t room = 0;
    NLS2F_MaxSize(fast, std::ssize(field), &room);
    const Answer answer = translate(fast, field, room);
    check(answer == translate(slow, field, room), "table and path agree");
    check(translate(fast, field, less) == translate(slow, field, less), "in any room");
    checkColumn(fast, field, length, again == 0 ? room * 9 : less);
    if (isCut) {
      checkPieces(fast, field, answer, input);
    }
  }
  NLS2F_CloseTranslator(slow);
  NLS2F_CloseTranslator(fast);
  return 0;
}
