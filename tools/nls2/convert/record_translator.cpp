// One record from one code page to another, shaped as the options say.

#include "convert/record_translator.h"

#include "base/errors.h"
#include "base/printable.h"
#include "codepage/code_page.h"

#include <algorithm>
#include <array>
#include <new>
#include <set>

namespace nls2::tool {

namespace {

nls2::translator makeTranslator(int32_t from, int32_t to, const nls2::field_policy &policy) {
  std::error_code error;
  nls2::translator made(nls2::code_page(from), nls2::code_page(to), policy, error);
  if (error) { // the pages have been opened before
    throw std::bad_alloc();
  }
  return made;
}

// Quotes the last `length` bytes, a field in UTF-8, if RFC 4180 requires it.
void quoteForCsv(ByteBuffer &out, std::size_t length) {
  const std::string_view field = out.bytes().substr(out.size() - length);
  if (field.find_first_of(",\"\r\n") == std::string_view::npos) {
    return;
  }
  std::string quoted = "\"";
  for (const char byte : field) {
    quoted.append(byte == '"' ? 2 : 1, byte);
  }
  out.truncate(out.size() - length);
  out.append(quoted + '"');
}

// The line end as it is after a text, without a signature. A page that switches modes for U+0085
// has no fixed bytes for it. By default records get no line end and lines get LF, unless they are
// filled.
std::string encodedNewline(const CodePage &page, const TranslateOptions &options) {
  constexpr std::array<std::u16string_view, 4> texts{u"", u"\n", u"\r\n", u"\u0085"};
  static const std::set wide{UCNV_UTF16, UCNV_UTF32, UCNV_UTF16_BigEndian, UCNV_UTF16_LittleEndian};
  const bool makesLines =
      options.csv || (options.recordLength == 0 && options.padding != nls2::padding::fill);
  const Newline newline = options.newline.value_or(makesLines ? Newline::lf : Newline::none);
  std::string bytes;
  for (const char16_t character : texts[static_cast<std::size_t>(newline)]) {
    const auto encoded = page.encoded(character);
    const bool changesMode = encoded && encoded->signatureLength != 0 && character > 0x7F;
    if (!encoded || (changesMode && !wide.contains(ucnv_getType(page.converter())))) {
      throw usageError("--newline: code page {} has no U+{:04X}", page.number(),
                       static_cast<unsigned>(character));
    }
    bytes += encoded->bytes;
  }
  return bytes;
}

bool padsWithBlanks(const TranslateOptions &options) {
  return options.padding == nls2::padding::fill || options.padding == nls2::padding::keep_blanks ||
         std::any_of(options.fields.begin(), options.fields.end(),
                     [](const FieldSpec &field) { return field.width != 0; });
}

} // namespace

OutputField::OutputField(const FieldSpec &spec, std::size_t number, const TranslateOptions &options)
    : spec_(spec), number_(number), to_(options.to),
      verifies_(options.verify && spec.kind == FieldSpec::Kind::text), csv_(options.csv) {
  nls2::field_policy &policy = policy_;
  policy.bad =
      options.onError == OnError::replace ? nls2::on_bad::replace_visibly : nls2::on_bad::stop;
  if (spec.width != 0) {
    policy.padding = nls2::padding::fill;
    policy.width = spec.width;
    limitedBy_ = Limit::fieldWidth;
  } else if (spec.kind == FieldSpec::Kind::text) {
    policy.padding = csv_ ? nls2::padding::strip : options.padding;
    policy.width = options.outLength;
    if (policy.padding == nls2::padding::fill && policy.width == 0) {
      policy.width = spec.length();
      limitedBy_ = Limit::ownLength;
    }
  }
  if (spec.kind != FieldSpec::Kind::raw) {
    const int32_t from = spec.kind == FieldSpec::Kind::hex ? utf8Page : spec.from;
    forward_ = makeTranslator(from, options.to, policy);
  }
}

std::optional<Problem> OutputField::translate(std::string_view record, ByteBuffer &out,
                                              std::size_t &replaced) {
  std::string_view field = number_ == 0 ? record : record.substr(spec_.begin, spec_.length());
  if (spec_.kind == FieldSpec::Kind::raw) {
    out.append(field);
    return {};
  }
  if (spec_.kind == FieldSpec::Kind::hex) {
    field = digits_ = hexOf(field);
  }
  const std::span<char> room = out.room(forward_->max_size(field.size()));
  const nls2::field_result result = forward_->translate(field, room);
  if (!result) {
    return describe(result);
  }
  if (verifies_ && result.replaced == 0) {
    if (auto problem = verify(field, {room.data(), result.written})) {
      return problem;
    }
  }
  replaced += result.replaced;
  out.commit(result.written);
  if (csv_) {
    quoteForCsv(out, result.written);
  }
  return {};
}

Problem OutputField::newProblem(ProblemKind kind) const {
  Problem problem;
  problem.kind = kind;
  problem.column = spec_.begin;
  problem.field = number_;
  problem.page = to_;
  problem.limitedBy = limitedBy_;
  problem.limit = policy_.width;
  return problem;
}

Problem OutputField::describe(const nls2::field_result &failed) const {
  const nls2::problem_kind kind = failed.problem.kind();
  Problem problem = newProblem(kind == nls2::problem_kind::none ? ProblemKind::noMemory
                                                                : static_cast<ProblemKind>(kind));
  problem.found = failed.problem;
  if (problem.kind == ProblemKind::invalidBytes) {
    problem.page = spec_.from;
  }
  if (spec_.kind == FieldSpec::Kind::text) {
    problem.column += failed.problem.offset();
  } else { // the digits of a hex field are not in the record
    problem.found.get()->byteCount = 0;
  }
  return problem;
}

// A padded field comes back padded to its own length.
std::optional<Problem> OutputField::verify(std::string_view field, std::string_view translated) {
  if (field.empty()) {
    return {};
  }
  nls2::field_policy policy;
  if (policy_.padding != nls2::padding::as_is) {
    policy.padding = nls2::padding::fill;
    policy.width = field.size();
  }
  if (!back_ || backWidth_ != policy.width) {
    back_ = makeTranslator(to_, spec_.from, policy);
    backWidth_ = policy.width;
  }
  cameBack_.clear();
  const bool comesBack = static_cast<bool>(back_->translate(translated, cameBack_));
  if (comesBack && cameBack_ == field) {
    return {};
  }
  Problem problem = newProblem(ProblemKind::notReversible);
  problem.found.get()->needed = static_cast<int64_t>(cameBack_.size());
  problem.limit = field.size();
  const auto [wrong, back] =
      std::mismatch(field.begin(), field.end(), cameBack_.cbegin(), cameBack_.cend());
  if (comesBack && wrong != field.end() && back != cameBack_.cend()) {
    problem.column += static_cast<std::size_t>(wrong - field.begin());
    problem.found.get()->bytes[0] = static_cast<uint8_t>(*wrong);
    problem.found.get()->byteCount = 1;
    problem.cameBack = static_cast<unsigned char>(*back);
  }
  return problem;
}

RecordTranslator::RecordTranslator(const TranslateOptions &options) : options_(&options) {
  const CodePage from(options.from, "--from");
  const CodePage to(options.to, "--to");
  if (padsWithBlanks(options) && !to.encoded(u' ')) {
    throw usageError("code page {} has no blank to pad with", options.to);
  }
  lineEnd_ = encodedNewline(to, options);
  if (options.fields.empty()) {
    FieldSpec whole;
    whole.from = options.from;
    whole.end = options.recordLength;
    fields_.emplace_back(whole, 0, options);
  }
  for (const FieldSpec &field : options.fields) {
    fields_.emplace_back(field, fields_.size() + 1, options);
  }
}

std::optional<Problem> RecordTranslator::translate(std::string_view record, ByteBuffer &out,
                                                   std::size_t &replaced) {
  if (record.size() < options_->recordLength) {
    Problem problem;
    problem.kind = ProblemKind::shortRecord;
    problem.found.get()->needed = static_cast<int64_t>(record.size());
    problem.limit = options_->recordLength;
    return problem;
  }
  const std::size_t before = out.size();
  for (OutputField &field : fields_) {
    if (options_->csv && &field != fields_.data()) {
      out.append(",");
    }
    if (auto problem = field.translate(record, out, replaced)) {
      out.truncate(before);
      return problem;
    }
  }
  out.append(lineEnd_);
  return {};
}

// The same work by a translator that stops there.
std::optional<Problem> RecordTranslator::firstReplaced(std::string_view record) const {
  TranslateOptions strict = *options_;
  strict.onError = OnError::stop;
  strict.verify = false;
  ByteBuffer dropped;
  std::size_t none = 0;
  return RecordTranslator(strict).translate(record, dropped, none);
}

} // namespace nls2::tool
