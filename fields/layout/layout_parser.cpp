// Reads the text of a layout: a line a field, or the short form.
#include "layout/layout.h"
#include "numbers/number.h"
#include "pages/character_bytes.h"

#include <charconv>
#include <map>
#include <new>
#include <optional>
#include <set>
#include <unicode/utf8.h>

namespace zelfields {
namespace {

constexpr std::string_view ownPage = "page:";

struct Word {
  std::string_view text;
  uint32_t value;
};

constexpr Word kinds[] = {{"text", NLS2F_TEXT},   {"raw", NLS2F_RAW},
                          {"hex", NLS2F_HEX},     {"packed", NLS2F_PACKED},
                          {"zoned", NLS2F_ZONED}, {"binary", NLS2F_BINARY}};

constexpr uint32_t signs = NLS2F_SIGN_LEADING | NLS2F_SIGN_SEPARATE;
constexpr Word optionWords[] = {{"unsigned", NLS2F_UNSIGNED},
                                {"blank=empty", NLS2F_BLANK_EMPTY},
                                {"sign=trailing", 0},
                                {"sign=leading", NLS2F_SIGN_LEADING},
                                {"sign=trailing-separate", NLS2F_SIGN_SEPARATE},
                                {"sign=leading-separate", signs}};

template <std::size_t size>
const Word *find(const Word (&words)[size], std::string_view text) {
  const Word *found = std::find_if(std::begin(words), std::end(words),
                                   [&](const Word &word) { return word.text == text; });
  return found != std::end(words) ? found : nullptr;
}

bool isOption(std::string_view word) { return find(optionWords, word) != nullptr; }

// A whole number that the text is, up to the longest field.
std::optional<int64_t> numberIn(std::string_view text) {
  int64_t number = 0;
  const char *const end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, number);
  if (error == std::errc::invalid_argument || stop != end || text[0] == '-') {
    return {};
  }
  return error == std::errc() ? std::min<int64_t>(number, INT64_MAX / 4) : INT64_MAX / 4;
}

// Without nulls, which would end it.
bool isUtf8(std::string_view text) {
  const auto *bytes = reinterpret_cast<const uint8_t *>(text.data());
  const auto size = static_cast<int32_t>(std::min<std::size_t>(text.size(), INT32_MAX));
  UChar32 character = 1;
  for (int32_t i = 0; i < size && character > 0;) {
    U8_NEXT(bytes, i, size, character);
  }
  return character > 0;
}

// Cuts off what comes before the separator, or all of the text.
std::string_view cutAt(std::string_view &text, std::string_view separators) {
  const std::size_t end = std::min(text.find_first_of(separators), text.size());
  const std::string_view before = text.substr(0, end);
  text.remove_prefix(end);
  return before;
}

// The digits, signs and the blank of a page, as a field has them.
struct PageBytes {
  uint8_t zero = 0; // unless its digits are F0 to F9 or 30 to 39
  uint8_t plus = 0;
  uint8_t minus = 0;
  uint8_t blank = 0;
  bool hasSigns = false;
  bool hasBlank = false;
};

PageBytes bytesOfPage(const NLS2F_Page &page) {
  const auto byteOf = [&](char16_t character, uint8_t &byte) {
    const std::string bytes = bytesOf(page, character);
    byte = bytes.size() == 1 ? static_cast<uint8_t>(bytes[0]) : 0;
    return bytes.size() == 1;
  };
  PageBytes found;
  bool hasDigits = byteOf(u'0', found.zero) && (found.zero == 0xF0 || found.zero == 0x30);
  for (char16_t digit = u'1'; digit <= u'9' && hasDigits; ++digit) {
    uint8_t byte = 0;
    hasDigits = byteOf(digit, byte) && byte == (found.zero | (digit & 0x0F));
  }
  found.zero = hasDigits ? found.zero : 0;
  found.hasSigns = byteOf(u'+', found.plus) && byteOf(u'-', found.minus);
  found.hasBlank = byteOf(u' ', found.blank);
  return found;
}

class LayoutParser {
public:
  LayoutParser(const NLS2F_Page &page, uint32_t options, NLS2F_Layout &layout, ProblemFacts &fault)
      : page_(bytesOfPage(page)), options_(options), layout_(layout), fault_(fault) {}

  bool parse(std::string_view text) {
    line_ = text.data();
    if (text.starts_with("\xEF\xBB\xBF")) {
      text.remove_prefix(3);
    }
    if ((options_ & NLS2F_LAYOUT_SHORT) != 0) {
      return parseShort(text);
    }
    for (bool more = true; more; ++fault_.record) {
      const std::string_view line = cutAt(text, "\n");
      if (!parseLine(line)) {
        return false;
      }
      more = !text.empty();
      text.remove_prefix(more ? 1 : 0);
      line_ = text.data();
    }
    fault_.record = 0;
    return !layout_.entries.empty() || fail(Detail::noField, text);
  }

private:
  // A name, which may be empty, bytes, and perhaps a kind and options.
  using Words = std::vector<std::string_view>;

  bool fail(Detail detail, std::string_view word) {
    fault_.kind = NLS2F_INVALID_LAYOUT;
    fault_.offset = word.data() - line_;
    fault_.needed = static_cast<int64_t>(detail);
    fault_.bytes = word;
    return false;
  }

  bool parseLine(std::string_view line) {
    line = cutAt(line, "#");
    Words words;
    while (line.remove_prefix(std::min(line.find_first_not_of(" \t\r"), line.size())),
           !line.empty()) {
      words.push_back(cutAt(line, " \t\r"));
    }
    return words.empty() || (words.size() == 1 ? fail(Detail::noBytes, line) : parseField(words));
  }

  // An option is cut off only if it is one, since the name of a page may have a colon in it.
  bool parseShort(std::string_view text) {
    for (bool more = true; more;) {
      std::string_view piece = cutAt(text, ";");
      more = !text.empty();
      text.remove_prefix(more ? 1 : 0);
      Words words = {piece.substr(0, 0), cutAt(piece, "=:")};
      if (piece.starts_with("=")) {
        piece.remove_prefix(1);
        std::string_view kind = piece.substr(0, piece.find(':'));
        if (piece.starts_with(ownPage)) {
          kind = piece;
          for (std::size_t colon = kind.rfind(':'); isOption(kind.substr(colon + 1));
               colon = kind.rfind(':')) {
            kind = kind.substr(0, colon);
          }
        }
        words.push_back(kind);
        piece.remove_prefix(kind.size());
      }
      while (piece.starts_with(":")) {
        piece.remove_prefix(1);
        words.push_back(cutAt(piece, ":"));
      }
      if (!parseField(words)) {
        return false;
      }
    }
    return true;
  }

  bool parseField(const Words &words) {
    NLS2F_Layout::Entry entry = {};
    NLS2F_Field &field = entry.field;
    field.size = sizeof field;
    field.zero = page_.zero;
    field.plus = page_.plus;
    field.minus = page_.minus;
    field.blank = page_.blank;
    if (!parseName(words[0], entry) || !parseBytes(words[1], field)) {
      return false;
    }
    std::size_t i = 2;
    if (words.size() > i && !isOption(words[i])) {
      if (!parseKind(words[i++], entry)) {
        return false;
      }
    }
    bool hasSign = false;
    for (; i < words.size(); ++i) {
      const bool isSign = words[i].starts_with("sign=");
      if (isSign && hasSign) {
        return fail(Detail::secondSign, words[i]);
      }
      hasSign = hasSign || isSign;
      if (!parseOption(words[i], field)) {
        return false;
      }
    }
    if (!check(words, field)) {
      return false;
    }
    next_ = field.first + field.length;
    layout_.length = std::max(layout_.length, next_);
    layout_.entries.push_back(std::move(entry));
    return true;
  }

  bool parseName(std::string_view word, NLS2F_Layout::Entry &entry) {
    if (!isUtf8(word)) {
      return fail(Detail::notUtf8, word);
    }
    if (!word.empty() && !names_.insert(word).second) {
      return fail(Detail::sameName, word);
    }
    entry.name = word;
    return true;
  }

  bool parseBytes(std::string_view word, NLS2F_Field &field) {
    const std::size_t dash = word.find('-');
    const auto first = numberIn(word.substr(0, dash));
    const auto last = dash == word.npos ? first : numberIn(word.substr(dash + 1));
    if (!first || !last) {
      return fail(Detail::notBytes, word);
    }
    if (*first == 0) {
      return fail(Detail::beginsAtZero, word);
    }
    if (*last < *first) {
      return fail(Detail::emptyRange, word);
    }
    field.first = dash == word.npos ? next_ : *first - 1;
    field.length = dash == word.npos ? *first : *last - field.first;
    return field.first + field.length <= INT32_MAX || fail(Detail::tooFar, word);
  }

  bool parseKind(std::string_view word, NLS2F_Layout::Entry &entry) {
    if (word.starts_with(ownPage)) {
      entry.page = word.substr(ownPage.size());
      NLS2F_Page *page = nullptr;
      const int32_t status = NLS2F_OpenPageByName(entry.page.c_str(), &page);
      NLS2F_ClosePage(page);
      if (status == NLS2_ERR_NO_MEMORY || status == U_MEMORY_ALLOCATION_ERROR) {
        throw std::bad_alloc();
      }
      const bool isName = !entry.page.empty() && entry.page.find('\0') == entry.page.npos;
      return (status <= 0 && isName) || fail(Detail::unknownPage, word);
    }
    const std::size_t dot = word.find('.');
    const Word *kind = find(kinds, word.substr(0, dot));
    const bool hasScale = dot != word.npos;
    if (kind == nullptr || (hasScale && kind->value < NLS2F_PACKED)) {
      return fail(Detail::unknownKind, word);
    }
    const auto scale = hasScale ? numberIn(word.substr(dot + 1)) : 0;
    if (!scale || *scale > Number::mostDigits) {
      return fail(Detail::badScale, word);
    }
    entry.field.kind = static_cast<int32_t>(kind->value);
    entry.field.scale = static_cast<int32_t>(*scale);
    return true;
  }

  bool parseOption(std::string_view word, NLS2F_Field &field) {
    const Word *option = find(optionWords, word);
    if (option == nullptr) {
      return fail(Detail::unknownOption, word);
    }
    const bool isSign = word.starts_with("sign=");
    if (field.kind < NLS2F_PACKED || (isSign && field.kind != NLS2F_ZONED)) {
      return fail(Detail::optionOfOtherKind, word);
    }
    field.options |= option->value;
    const bool signAndNone = (field.options & NLS2F_UNSIGNED) != 0 && (field.options & signs) != 0;
    return !signAndNone || fail(Detail::secondSign, word);
  }

  // What the field's words mean together.
  bool check(const Words &words, const NLS2F_Field &field) {
    const bool isZoned = field.kind == NLS2F_ZONED;
    if (isZoned &&
        (field.zero == 0 || ((field.options & NLS2F_SIGN_SEPARATE) != 0 && !page_.hasSigns))) {
      return fail(Detail::noDigits, words[2]);
    }
    if ((field.options & NLS2F_BLANK_EMPTY) != 0 && !page_.hasBlank) {
      return fail(Detail::noSingleBlank, words[3]);
    }
    if (field.kind >= NLS2F_PACKED && !isNumberField(field)) {
      return fail(Detail::badLength, words[1]);
    }
    return (options_ & NLS2F_LAYOUT_WRITES) == 0 || claim(words[1], field);
  }

  bool claim(std::string_view word, const NLS2F_Field &field) {
    const int64_t end = field.first + field.length;
    const auto after = taken_.lower_bound(field.first);
    if ((after != taken_.end() && after->first < end) ||
        (after != taken_.begin() && std::prev(after)->second > field.first)) {
      return fail(Detail::overlap, word);
    }
    taken_.emplace(field.first, end);
    return true;
  }

  const PageBytes page_;
  const uint32_t options_;
  NLS2F_Layout &layout_;
  ProblemFacts &fault_;
  int64_t next_ = 0; // where a field begins that has its length alone
  const char *line_ = nullptr;
  std::set<std::string_view> names_;
  std::map<int64_t, int64_t> taken_; // the beginnings and ends of fields that are written
};

} // namespace

bool parseLayout(std::string_view text, const NLS2F_Page &page, uint32_t options,
                 NLS2F_Layout &layout, ProblemFacts &fault) {
  return LayoutParser(page, options, layout, fault).parse(text);
}

} // namespace zelfields
