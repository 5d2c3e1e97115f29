// One field of the output: how it is made of its bytes in a record.

#include "convert/output_field.h"

#include "codepage/code_page.h"
#include "convert/csv.h"

#include <algorithm>
#include <new>

namespace nls2::tool {

namespace {

nls2::field_translator makeTranslator(int32_t from, int32_t to, const nls2::field_policy &policy) {
  std::error_code error;
  nls2::field_translator made(nls2::code_page(from), nls2::code_page(to), policy, error);
  if (error) { // the pages have been opened before
    throw std::bad_alloc();
  }
  return made;
}

std::string digitsOf(std::string_view bytes) {
  constexpr std::string_view digits = "0123456789ABCDEF";
  std::string text;
  text.reserve(2 * bytes.size());
  for (const char byte : bytes) {
    const auto value = static_cast<unsigned char>(byte);
    text += digits[value >> 4];
    text += digits[value & 15];
  }
  return text;
}

ProblemKind kindOf(nls2::field_problem problem) {
  switch (problem) {
  case nls2::field_problem::invalid_bytes:
    return ProblemKind::invalidBytes;
  case nls2::field_problem::not_in_page:
    return ProblemKind::notInPage;
  case nls2::field_problem::embedded_null:
    return ProblemKind::nullInside;
  case nls2::field_problem::no_exact_fill:
    return ProblemKind::noExactFill;
  case nls2::field_problem::no_room:
    return ProblemKind::tooLong;
  default:
    return ProblemKind::noMemory;
  }
}

} // namespace

OutputField::OutputField(const FieldSpec &spec, std::size_t number, const TranslateOptions &options)
    : spec_(spec), number_(number), verifies_(options.verify && spec.kind == FieldSpec::Kind::text),
      csv_(options.csv) {
  nls2::field_policy policy;
  policy.bad = options.onError == OnError::replace ? nls2::on_bad::replace : nls2::on_bad::stop;
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
  const std::string_view bytes = number_ == 0 ? record : record.substr(spec_.begin, spec_.length());
  switch (spec_.kind) {
  case FieldSpec::Kind::raw:
    out.append(bytes);
    return {};
  case FieldSpec::Kind::hex:
    digits_ = digitsOf(bytes);
    return translateText(digits_, out, replaced);
  default:
    return translateText(bytes, out, replaced);
  }
}

std::optional<Problem> OutputField::translateText(std::string_view field, ByteBuffer &out,
                                                  std::size_t &replaced) {
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
  problem.page = forward_->to().number();
  problem.limitedBy = limitedBy_;
  problem.limit = forward_->policy().width;
  return problem;
}

Problem OutputField::describe(const nls2::field_result &failed) const {
  Problem problem = newProblem(kindOf(failed.problem));
  if (problem.kind == ProblemKind::invalidBytes) {
    problem.page = spec_.from;
  }
  if (spec_.kind == FieldSpec::Kind::text) { // the digits of a hex field are not in the record
    problem.column += failed.offset;
    problem.byteCount = failed.byte_count;
    problem.bytes = failed.bytes;
  }
  problem.codePoint = failed.code_point;
  problem.needed = failed.needed;
  return problem;
}

// A padded field comes back padded to its own length.
void OutputField::prepareToVerify(std::size_t length) {
  nls2::field_policy policy;
  if (forward_->policy().padding != nls2::padding::as_is) {
    policy.padding = nls2::padding::fill;
    policy.width = length;
  }
  if (!back_ || back_->policy().width != policy.width) {
    back_ = makeTranslator(forward_->to().number(), spec_.from, policy);
  }
}

std::optional<Problem> OutputField::verify(std::string_view field, std::string_view translated) {
  if (field.empty()) {
    return {};
  }
  prepareToVerify(field.size());
  cameBack_.clear();
  if (!back_->translate(translated, cameBack_)) {
    return newProblem(ProblemKind::notReversible);
  }
  if (cameBack_ == field) {
    return {};
  }
  const auto [wrong, back] =
      std::mismatch(field.begin(), field.end(), cameBack_.cbegin(), cameBack_.cend());
  Problem problem = newProblem(ProblemKind::notReversible);
  problem.column += static_cast<std::size_t>(wrong - field.begin());
  if (wrong != field.end()) {
    problem.bytes[0] = *wrong;
    problem.byteCount = 1;
    problem.cameBack = back != cameBack_.cend() ? static_cast<unsigned char>(*back) : -1;
  }
  return problem;
}

} // namespace nls2::tool
