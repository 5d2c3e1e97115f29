// One record from one code page to another, shaped as the options say.

#include "convert/record_translator.h"

#include "codepage/code_page.h"
#include "errors.h"

#include <algorithm>

namespace nls2::tool {

namespace {

std::u16string_view textOf(Newline newline) {
  switch (newline) {
  case Newline::lf:
    return u"\n";
  case Newline::crlf:
    return u"\r\n";
  case Newline::nel:
    return u"\u0085";
  default:
    return u"";
  }
}

bool isUtf16Or32(const CodePage &page) {
  const UConverterType type = ucnv_getType(page.converter());
  return type == UCNV_UTF16 || type == UCNV_UTF32 || type == UCNV_UTF16_BigEndian ||
         type == UCNV_UTF16_LittleEndian;
}

// As it is after a record's text, without a signature. Pages that change their mode for U+0085 have
// no bytes that always mean it.
std::string encodedNewline(const CodePage &page, Newline newline) {
  std::string bytes;
  for (const char16_t character : textOf(newline)) {
    const auto encoded = page.encoded(character);
    const bool changesMode = encoded && encoded->signatureLength != 0 && character > 0x7F;
    if (!encoded || (changesMode && !isUtf16Or32(page))) {
      throw usageError("--newline: code page {} has no U+{:04X}", page.number(),
                       static_cast<unsigned>(character));
    }
    bytes += encoded->bytes;
  }
  return bytes;
}

// Where nothing else is asked for, records are not ended and lines are, unless they are filled.
Newline newlineOf(const TranslateOptions &options) {
  const bool makesLines =
      options.csv || (options.recordLength == 0 && options.padding != nls2::padding::fill);
  return options.newline.value_or(makesLines ? Newline::lf : Newline::none);
}

bool padsWithBlanks(const TranslateOptions &options) {
  return options.padding == nls2::padding::fill || options.padding == nls2::padding::keep_blanks ||
         std::any_of(options.fields.begin(), options.fields.end(),
                     [](const FieldSpec &field) { return field.width != 0; });
}

} // namespace

RecordTranslator::RecordTranslator(const TranslateOptions &options)
    : options_(&options), separator_(options.csv ? "," : "") {
  const CodePage from(options.from, "--from");
  const CodePage to(options.to, "--to");
  if (padsWithBlanks(options) && !to.encoded(u' ')) {
    throw usageError("code page {} has no blank to pad with", options.to);
  }
  lineEnd_ = encodedNewline(to, newlineOf(options));
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
  const std::size_t before = out.size();
  for (std::size_t i = 0; i < fields_.size(); ++i) {
    if (i > 0) {
      out.append(separator_);
    }
    if (auto problem = fields_[i].translate(record, out, replaced)) {
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
