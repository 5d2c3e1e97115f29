// The list of --fields: which bytes of a record become which fields of the output.

#include "convert/field_list.h"

#include "codepage/code_page.h"
#include "errors.h"

#include <charconv>
#include <optional>
#include <string_view>

namespace nls2::tool {

namespace {

constexpr std::size_t longest = std::size_t{1} << 30;

// A decimal number up to 2^30; nothing where the text is not one.
std::optional<std::size_t> numberIn(std::string_view text) {
  std::size_t number = 0;
  const char *end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, number);
  return error == std::errc() && stop == end && number <= longest ? std::optional(number)
                                                                  : std::nullopt;
}

// One piece of the list, taken apart from its end.
class FieldParser {
public:
  FieldParser(std::string_view piece, std::size_t recordLength, int32_t from, bool csv)
      : piece_(piece), rest_(piece), recordLength_(recordLength), csv_(csv) {
    field_.from = from;
  }

  FieldSpec parse() {
    parseWidth();
    parseKind();
    parseRange();
    if (field_.kind == FieldSpec::Kind::raw && field_.width != 0) {
      throw wrong("raw bytes have no width");
    }
    if (csv_ && field_.kind == FieldSpec::Kind::raw) {
      throw wrong("raw bytes are not text, as --csv needs it; hex is");
    }
    if (csv_ && field_.width != 0) {
      throw wrong("--csv strips its fields, which have no width");
    }
    return field_;
  }

private:
  Error wrong(const char *why) const {
    return usageError("--fields: \"{}\": {}", printable(piece_), why);
  }

  // Cuts off what follows the separator.
  std::optional<std::string_view> cut(char separator) {
    const std::size_t at = rest_.find(separator);
    if (at == std::string_view::npos) {
      return {};
    }
    const std::string_view after = rest_.substr(at + 1);
    rest_ = rest_.substr(0, at);
    return after;
  }

  void parseWidth() {
    if (const auto text = cut(':')) {
      const auto width = numberIn(*text);
      if (!width || *width == 0) {
        throw wrong("the width must be a number from 1 to 1073741824");
      }
      field_.width = *width;
    }
  }

  void parseKind() {
    const auto kind = cut('=');
    if (!kind || *kind == "text") {
      return;
    }
    if (*kind == "raw") {
      field_.kind = FieldSpec::Kind::raw;
    } else if (*kind == "hex") {
      field_.kind = FieldSpec::Kind::hex;
    } else if (kind->empty()) {
      throw wrong("a kind must follow \"=\": text, raw, hex or a code page");
    } else {
      const std::string option = fmt::format("--fields: \"{}\"", printable(piece_));
      field_.from = parsePage(option.c_str(), std::string(*kind));
      const CodePage opens(field_.from, option.c_str());
    }
  }

  void parseRange() {
    const auto last = cut('-');
    const auto start = numberIn(rest_);
    const auto end = last ? numberIn(*last) : std::nullopt;
    if (!start || !end) {
      throw wrong("a field is START-END[=KIND][:WIDTH]");
    }
    if (*start == 0) {
      throw wrong("bytes are counted from 1");
    }
    if (*end < *start) {
      throw wrong("the range is empty");
    }
    if (*end > recordLength_) {
      throw usageError("--fields: \"{}\": the range goes past the record of {} bytes",
                       printable(piece_), recordLength_);
    }
    field_.begin = *start - 1;
    field_.end = *end;
  }

  const std::string_view piece_;
  std::string_view rest_;
  const std::size_t recordLength_;
  const bool csv_;
  FieldSpec field_;
};

} // namespace

std::vector<FieldSpec> parseFields(const std::string &list, std::size_t recordLength, int32_t from,
                                   bool csv) {
  std::vector<FieldSpec> fields;
  std::string_view rest = list;
  for (bool more = true; more;) {
    const std::size_t comma = rest.find(',');
    fields.push_back(FieldParser(rest.substr(0, comma), recordLength, from, csv).parse());
    more = comma != std::string_view::npos;
    rest.remove_prefix(more ? comma + 1 : rest.size());
  }
  return fields;
}

} // namespace nls2::tool
