// nls2 sort and nls2 compare: texts in the order of a language.

#include "io/output_file.h"
#include "locale/locale_option.h"
#include "options.h"
#include "text/decoder.h"
#include "text/record_reader.h"

#include <cstring>
#include <endian.h>
#include <memory>
#include <memory_resource>
#include <unicode/ucol.h>

namespace nls2::tool {

namespace {

constexpr const char *sortNotes =
    R"(The order counts case, accents and punctuation; lines that it holds equal stay in the order of the
input. Lines end in U+000A as the code page writes it; a last line without it gets one. A line whose
bytes are not valid in the code page is an error, and nothing is written then. All lines are held in
memory. OUT may be one of the FILEs.
)";

constexpr const char *compareNotes =
    R"(Prints -1 if A sorts before B, 1 if B sorts before A, 0 if they are equal. The order counts case,
accents and punctuation. A and B are bytes of the code page.
Exit codes: 0 equal, 1 not equal, 2 anything that went wrong.
)";

struct Arguments {
  LocaleOptions locale;
  bool ignoreTrailing = false;
  std::size_t recordLength = 0;
  std::vector<std::string> inputs;
  std::string output = "-";
  std::string a, b;
};

// Gives every text a key; the keys' bytes compare as the library's comparison orders the texts, and
// for the locale C as their code points do. For one thread at a time.
class LineOrder {
public:
  // Throws usageError.
  explicit LineOrder(const Arguments &arguments)
      : decoder_(arguments.locale.codepage), ignoreTrailing_(arguments.ignoreTrailing) {
    const std::string locale = orderLocale(arguments.locale);
    if (locale == byCodePoint) {
      return;
    }
    UErrorCode error = U_ZERO_ERROR;
    collator_.adoptInstead(ucol_open(locale.c_str(), &error));
    if (U_FAILURE(error)) {
      throw failure("cannot open the order of {}: {}", locale, statusText(error));
    }
    ucol_setStrength(collator_.getAlias(), UCOL_TERTIARY);
  }

  // Valid until the next call. Throws TextFault. The library's comparison makes nulls of trailing
  // blanks; the collator ignores nulls, so that cutting them off is the same.
  std::string_view keyOf(std::string_view bytes) {
    std::u16string_view text = decoder_.decode(bytes);
    if (ignoreTrailing_) {
      text = withoutBlanks(withoutNulls(text));
    }
    if (collator_.isNull()) {
      return codePointKey(text);
    }
    const int32_t length = ucol_getSortKey(
        collator_.getAlias(), text.data(), static_cast<int32_t>(text.size()),
        reinterpret_cast<uint8_t *>(key_.data()), static_cast<int32_t>(key_.size()));
    if (length <= 0) { // also the key of an empty text has a byte, its terminator
      throw std::bad_alloc();
    }
    if (static_cast<std::size_t>(length) > key_.size()) {
      key_.resize(static_cast<std::size_t>(length));
      return keyOf(bytes);
    }
    return {key_.data(), static_cast<std::size_t>(length)};
  }

  std::string lineFeed() const { return lineFeedOf(decoder_.page(), true); }

private:
  std::string_view codePointKey(std::u16string_view text) {
    key_.clear();
    for (std::size_t i = 0; i < text.size();) {
      UChar32 character = 0;
      U16_NEXT(text.data(), i, text.size(), character);
      for (const int shift : {16, 8, 0}) {
        key_ += static_cast<char>(character >> shift);
      }
    }
    return key_;
  }

  Decoder decoder_;
  const bool ignoreTrailing_;
  icu::LocalUCollatorPointer collator_; // none: by code point
  std::string key_ = std::string(256, '\0');
};

// A line with its sort key. Most comparisons need the first bytes of the keys only, and those are
// beside each other.
struct KeyedLine {
  uint64_t prefix;   // of the key, in an order that compares as its bytes do
  const char *bytes; // the key, and after it the line
  uint32_t keyLength;
  uint32_t lineLength;

  std::string_view key() const { return {bytes, keyLength}; }
  std::string_view line() const { return {bytes + keyLength, lineLength}; }
  bool operator<(const KeyedLine &other) const {
    return prefix != other.prefix ? prefix < other.prefix : key() < other.key();
  }
};

class Lines {
public:
  // Keeps copies of both.
  void add(std::string_view line, std::string_view key) {
    auto *const bytes = static_cast<char *>(memory_.allocate(key.size() + line.size(), 1));
    std::copy(line.begin(), line.end(), std::copy(key.begin(), key.end(), bytes));
    uint64_t prefix = 0;
    std::memcpy(&prefix, key.data(), std::min(key.size(), sizeof prefix));
    lines_.push_back({be64toh(prefix), bytes, static_cast<uint32_t>(key.size()),
                      static_cast<uint32_t>(line.size())});
  }

  // Lines with equal keys are in the order in which they were added.
  const std::vector<KeyedLine> &sorted() {
    std::stable_sort(lines_.begin(), lines_.end());
    return lines_;
  }

private:
  std::pmr::monotonic_buffer_resource memory_{std::size_t{1} << 20};
  std::vector<KeyedLine> lines_;
};

int sortFiles(const Arguments &arguments) {
  LineOrder order(arguments);
  const auto keyOf = [&](std::string_view text) { return order.keyOf(text); };
  const std::string terminator = arguments.recordLength == 0 ? order.lineFeed() : "";
  Lines lines;
  for (const std::string &path : inputsOf(arguments.inputs)) {
    RecordFile file(
        path,
        {.length = arguments.recordLength, .page = arguments.locale.codepage, .isText = false});
    while (const auto line = file.next()) {
      lines.add(line->text, file.apply(*line, keyOf));
    }
  }
  OutputFile output(arguments.output);
  for (const KeyedLine &each : lines.sorted()) {
    output.put(each.line());
    output.put(terminator);
  }
  output.commit();
  return exitDone;
}

int compare(const Arguments &arguments) {
  LineOrder order(arguments);
  const auto keyOf = [&](const char *name, const std::string &text) {
    try {
      return std::string(order.keyOf(text));
    } catch (const TextFault &fault) {
      throw failure("{}{}", name, fault.what());
    }
  };
  const std::string a = keyOf("A", arguments.a);
  const std::string b = keyOf("B", arguments.b);
  print(a < b ? "-1\n" : a > b ? "1\n" : "0\n");
  return a == b ? exitDone : exitFailed;
}

Option ignoreTrailing(Arguments &arguments) {
  return flag("ignore-trailing", "trailing blanks do not count", into(arguments.ignoreTrailing));
}

} // namespace

Command sortCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {.operands = {{"FILE", "files to read; standard input if - or not given",
                        into(arguments->inputs), 0, Operand::anyNumber}},
          .options = localeOptions(
              arguments->locale,
              {ignoreTrailing(*arguments),
               numberValue("record-length", "N", "sort records of N bytes instead of lines",
                           arguments->recordLength, 1, 1 << 30),
               value("output", "OUT", "file to write; standard output if - or not given",
                     into(arguments->output), 'o')}),
          .notes = sortNotes,
          .run = [arguments] { return sortFiles(*arguments); }};
}

Command compareCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {.operands = {{"A", "the first string", into(arguments->a), 1},
                       {"B", "the second string", into(arguments->b), 1}},
          .options = localeOptions(arguments->locale, {ignoreTrailing(*arguments)}),
          .notes = compareNotes,
          .run = [arguments] { return compare(*arguments); }};
}

} // namespace nls2::tool
