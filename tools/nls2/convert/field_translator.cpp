// The translation of one field: text, digits or a number, in one record or in many.

#include "convert/field_translator.h"

#include "base/printable.h"

#include <algorithm>
#include <charconv>

namespace nls2::tool {

namespace {

constexpr int64_t longestNumber = 34; // as text

bool appendFromHex(std::string_view digits, ByteBuffer &bytes) {
  for (std::size_t i = 0; i + 1 < digits.size(); i += 2) {
    unsigned char byte = 0;
    const char *end = digits.data() + i + 2;
    if (std::from_chars(digits.data() + i, end, byte, 16).ptr != end) {
      return false;
    }
    bytes.append({reinterpret_cast<const char *>(&byte), 1});
  }
  return true;
}

} // namespace

NLS2F_Translator *Translators::get(const CodePage &from, const CodePage &to, int32_t padding,
                                   int32_t onBad, int64_t width) {
  for (const Entry &each : open_) {
    if (each.from == from.get() && each.to == to.get() && each.padding == padding &&
        each.onBad == onBad && each.width == width) {
      return each.translator.get();
    }
  }
  open_.push_back({from.get(), to.get(), padding, onBad, width,
                   openTranslator(from, to, padding, onBad, width)});
  return open_.back().translator.get();
}

FieldTranslator::FieldTranslator(const FieldPlan &plan, const Plan &run, bool replaces)
    : plan_(&plan), readsText_(run.readsCsv), writesText_(run.writesCsv), replaces_(replaces) {}

// Numbers and digits are ASCII in CSV, and so on both sides of it.
bool FieldTranslator::convert(std::string_view field, ByteBuffer &bytes, FieldFault &fault) const {
  const auto length = static_cast<std::size_t>(plan_->field.length);
  if (plan_->isNumber()) {
    const bool isFine = numberOf(field, writesText_, bytes, fault.found);
    fault.words = isFine ? "" : wordsOf(fault.found);
    return isFine;
  }
  if (plan_->field.kind == NLS2F_HEX && writesText_) {
    bytes.append(hexOf(field));
  } else if (plan_->field.kind == NLS2F_HEX && readsText_) {
    if (field.size() != 2 * length || !appendFromHex(field, bytes)) {
      fault.found.kind = invalidHex;
      fault.words = fmt::format("{} hexadecimal digits must be here", 2 * length);
      return false;
    }
  } else {
    bytes.append(field);
  }
  return true;
}

bool FieldTranslator::numberOf(std::string_view field, bool toText, ByteBuffer &bytes,
                               NLS2F_Problem &problem) const {
  const NLS2F_Field &kind = plan_->field;
  int64_t written = kind.length;
  char *room = bytes.room(static_cast<std::size_t>(std::max(kind.length, longestNumber))).data();
  const bool isFine = isDone(
      toText ? NLS2F_NumberToText(&kind, field.data(), room, longestNumber, &written, &problem)
             : NLS2F_TextToNumber(&kind, field.data(), sizeOf(field), room, &problem));
  bytes.commit(static_cast<std::size_t>(isFine ? written : 0));
  return isFine;
}

// First strictly, so that every problem is found.
FieldResult FieldTranslator::translateText(std::string_view field, Translators &open,
                                           ByteBuffer &bytes) const {
  FieldResult result;
  FieldFault fault;
  for (const int32_t onBad : {NLS2F_STOP, NLS2F_REPLACE_VISIBLY}) {
    NLS2F_Translator *translator =
        open.get(plan_->from, plan_->to, plan_->padding, onBad, plan_->width);
    auto found = sized<NLS2F_Problem>();
    int64_t room = 0;
    int64_t written = 0;
    isDone(NLS2F_MaxSize(translator, sizeOf(field), &room));
    char *out = bytes.room(static_cast<std::size_t>(room)).data();
    if (isDone(NLS2F_Translate(translator, field.data(), sizeOf(field), out, room, &written,
                               &result.replaced, &found))) {
      bytes.commit(static_cast<std::size_t>(written));
      return result;
    }
    fault = {found, found.kind == NLS2F_NO_ROOM && plan_->width != 0
                        ? fmt::format("the text needs {} bytes, but its place has {}", found.needed,
                                      plan_->width)
                        : wordsOf(found, translator)};
    result.fault = fault;
    const bool mayReplace = found.kind == NLS2F_INVALID_BYTES || found.kind == NLS2F_NOT_IN_PAGE;
    if (!replaces_ || !mayReplace) {
      result.replaced = 0;
      break;
    }
  }
  return result;
}

FieldResult FieldTranslator::translate(std::string_view field, Translators &open, ByteBuffer &bytes,
                                       NLS2F_Span &value) const {
  FieldResult result;
  FieldFault fault;
  const std::size_t before = bytes.size();
  if (plan_->field.kind == NLS2F_TEXT) {
    result = translateText(field, open, bytes);
  } else if (!convert(field, bytes, fault)) {
    result.fault = std::move(fault);
    bytes.truncate(before);
  }
  value = {static_cast<int64_t>(before), static_cast<int64_t>(bytes.size() - before)};
  return result;
}

void FieldTranslator::translateAll(const FieldColumn &rows, Translators &open, ByteBuffer &bytes,
                                   std::vector<NLS2F_Span> &values,
                                   std::vector<uint8_t> &good) const {
  const auto count = static_cast<std::size_t>(rows.rows);
  const bool isText = plan_->field.kind == NLS2F_TEXT;
  values.assign(count, {0, 0});
  good.assign((count + 7) / 8, 0);
  if (!isText && (!plan_->isNumber() || !writesText_)) {
    return; // one by one
  }
  std::vector<int64_t> offsets(count + 1);
  NLS2F_Translator *translator =
      !isText ? nullptr
      : plan_->fillsLater
          ? open.get(plan_->from, plan_->to, NLS2F_STRIP, NLS2F_STOP, 0)
          : open.get(plan_->from, plan_->to, plan_->padding, NLS2F_STOP, plan_->width);
  int64_t most = longestNumber;
  if (isText) {
    isDone(NLS2F_MaxSize(translator, plan_->field.length, &most));
  }
  auto column = sized<NLS2F_Column>();
  column.offsetBits = 64;
  column.fields = rows.first;
  column.length = plan_->field.length;
  column.stride = rows.stride;
  column.rows = rows.rows;
  column.room = most * rows.rows;
  column.out = bytes.room(static_cast<std::size_t>(column.room)).data();
  column.offsets = offsets.data();
  column.good = good.data();
  auto problem = sized<NLS2F_Problem>();
  const int32_t status = isText ? NLS2F_TranslateColumn(translator, &column, &problem)
                                : NLS2F_NumberColumn(&plan_->field, &column, &problem);
  if (!isDone(status) || column.done != rows.rows) {
    throw failure("{}", wordsOf(problem)); // there is room for every row
  }
  const auto base = static_cast<int64_t>(bytes.size());
  for (std::size_t i = 0; i < count; ++i) {
    values[i] = {base + offsets[i], offsets[i + 1] - offsets[i]};
    if (plan_->fillsLater && values[i].length > plan_->width) {
      good[i / 8] &= static_cast<uint8_t>(~(1U << i % 8));
    }
  }
  bytes.commit(static_cast<std::size_t>(offsets[count]));
}

bool FieldTranslator::convertBack(std::string_view value, std::string &back,
                                  Translators &open) const {
  auto problem = sized<NLS2F_Problem>();
  if (plan_->field.kind == NLS2F_TEXT) {
    const int32_t padding = plan_->padding == NLS2F_AS_IS ? NLS2F_AS_IS : NLS2F_STRIP;
    return nls2::tool::translateText(open.get(plan_->to, plan_->from, padding, NLS2F_STOP, 0),
                                     value, back, problem);
  }
  ByteBuffer bytes;
  bool isFine = true;
  if (plan_->isNumber()) {
    isFine = numberOf(value, readsText_, bytes, problem);
  } else if (plan_->field.kind == NLS2F_HEX && writesText_) {
    isFine = appendFromHex(value, bytes);
  } else if (plan_->field.kind == NLS2F_HEX && readsText_) {
    bytes.append(hexOf(value));
  } else {
    bytes.append(value);
  }
  back = bytes.bytes();
  return isFine;
}

// A text that was padded comes back with blanks up to its own length.
std::optional<FieldFault> FieldTranslator::verify(std::string_view field, std::string_view value,
                                                  Translators &open) const {
  std::string back;
  const bool comesBack = convertBack(value, back, open);
  const bool isPadded = plan_->field.kind == NLS2F_TEXT && plan_->padding != NLS2F_AS_IS;
  while (isPadded && !plan_->blank.empty() && back.size() + plan_->blank.size() <= field.size()) {
    back += plan_->blank;
  }
  if (comesBack && back == field) {
    return {};
  }
  FieldFault fault;
  fault.found.kind = notReversible;
  const auto [wrong, came] = std::mismatch(field.begin(), field.end(), back.cbegin(), back.cend());
  fault.found.offset = comesBack ? wrong - field.begin() : 0;
  if (!comesBack) {
    fault.words = "not reversible: it does not come back";
  } else if (wrong == field.end() || came == back.cend()) {
    fault.words =
        fmt::format("not reversible: its {} bytes come back as {}", field.size(), back.size());
  } else {
    fault.found.bytes[0] = static_cast<uint8_t>(*wrong);
    fault.found.byteCount = 1;
    fault.words = fmt::format("not reversible: the byte {:02X} comes back as {:02X}",
                              fault.found.bytes[0], static_cast<uint8_t>(*came));
  }
  return fault;
}

} // namespace nls2::tool
