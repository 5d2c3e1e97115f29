// Parses the list of --fields.

#include "base/options.h"
#include "codepage/code_page.h"
#include "convert/translate_options.h"

#include <string_view>

namespace nls2::tool {

namespace {

constexpr std::size_t longest = std::size_t{1} << 30;

// Cuts off the text after the separator; nothing if there is no separator.
std::optional<std::string_view> cut(std::string_view &text, char separator) {
  const std::size_t at = text.find(separator);
  if (at == std::string_view::npos) {
    return {};
  }
  const std::string_view after = text.substr(at + 1);
  text = text.substr(0, at);
  return after;
}

FieldSpec parseField(std::string_view piece, const TranslateOptions &options) {
  const std::string who = fmt::format("--fields: \"{}\"", printable(piece));
  const auto require = [&](bool holds, std::string_view why) {
    if (!holds) {
      throw usageError("{}: {}", who, why);
    }
  };
  const auto width = cut(piece, ':');
  const auto kind = cut(piece, '=');
  const auto last = cut(piece, '-');
  FieldSpec field;
  field.from = options.from;
  if (width) {
    field.width = wholeNumber<std::size_t>(*width).value_or(0);
    require(field.width != 0 && field.width <= longest,
            "the width must be a number from 1 to 1073741824");
  }
  if (kind == "raw" || kind == "hex") {
    field.kind = kind == "raw" ? FieldSpec::Kind::raw : FieldSpec::Kind::hex;
  } else if (kind && kind != "text") {
    require(!kind->empty(), "\"=\" must be followed by text, raw, hex or a code page");
    field.from = parsePage(who.c_str(), std::string(*kind));
    const CodePage opens(field.from, who.c_str());
  }
  const auto first = wholeNumber<std::size_t>(piece);
  const auto end = wholeNumber<std::size_t>(last.value_or(""));
  require(first && end, "a field is START-END[=KIND][:WIDTH]");
  require(*first != 0, "bytes are counted from 1");
  require(*end >= *first, "the range is empty");
  require(*end <= options.recordLength,
          fmt::format("the range ends after the record of {} bytes", options.recordLength));
  field.begin = *first - 1;
  field.end = *end;
  const bool isRaw = field.kind == FieldSpec::Kind::raw;
  require(!isRaw || field.width == 0, "raw bytes have no width");
  require(!isRaw || !options.csv, "--csv needs text; use hex in place of raw");
  require(field.width == 0 || !options.csv, "--csv strips its fields, so they have no width");
  return field;
}

} // namespace

std::vector<FieldSpec> parseFields(std::string_view list, const TranslateOptions &options) {
  std::vector<FieldSpec> fields;
  for (std::optional rest = list; rest;) {
    std::string_view piece = *rest;
    rest = cut(piece, ',');
    fields.push_back(parseField(piece, options));
  }
  return fields;
}

} // namespace nls2::tool
