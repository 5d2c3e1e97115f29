// nls2 translate against bare ICU, a record at a time: random pages, options and records. Blanks
// are counted here by trying every number of them.

#include "tool_runner.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <map>
#include <optional>
#include <random>
#include <sstream>
#include <unicode/uchar.h>
#include <unicode/ucnv.h>
#include <unicode/ucnv_cb.h>
#include <unicode/utf16.h>

namespace tools {

namespace {

// The converter that each number opens.
const std::map<int, const char *> pages{
    {37, "ibm-37"},      {273, "ibm-273"},    {500, "ibm-500"},   {819, "ISO-8859-1"},
    {930, "ibm-930"},    {939, "ibm-939"},    {943, "ibm-943"},   {1141, "ibm-1141"},
    {1200, "UTF-16BE"},  {1208, "UTF-8"},     {1388, "ibm-1388"}, {57359, "UTF-16LE"},
    {57360, "UTF-32BE"}, {57361, "UTF-32LE"}, {57362, "HZ"},      {57363, "SCSU"},
    {57366, "UTF-7"},    {57367, "BOCU-1"},   {57368, "UTF-16"},  {57369, "UTF-32"}};

enum class Padding { none, strip, fill, keep };
enum class OnError { stop, replace, reject };

using namespace std::string_literals;
using Bytes = std::optional<std::string>; // nothing: refused

// ICU's own leave out characters that are ignorable by default.
void leaveError(const void *, UConverterFromUnicodeArgs *, const UChar *, int32_t, UChar32,
                UConverterCallbackReason, UErrorCode *) {}
void substitute(const void *, UConverterFromUnicodeArgs *arguments, const UChar *, int32_t, UChar32,
                UConverterCallbackReason reason, UErrorCode *error) {
  if (reason <= UCNV_IRREGULAR) {
    *error = U_ZERO_ERROR;
    ucnv_cbFromUWriteSub(arguments, 0, error);
  }
}

// One converter, which stops at what is bad or replaces it.
class Page {
public:
  Page(int number, bool replaces) {
    UErrorCode error = U_ZERO_ERROR;
    converter_.adoptInstead(ucnv_open(pages.at(number), &error));
    UConverter *const opened = converter_.getAlias();
    ucnv_setFromUCallBack(opened, replaces ? substitute : leaveError, nullptr, nullptr, nullptr,
                          &error);
    if (!replaces) {
      ucnv_setToUCallBack(opened, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
    }
    EXPECT_TRUE(U_SUCCESS(error)) << number;
  }

  std::optional<std::u16string> decode(const std::string &bytes) const {
    UErrorCode error = U_ZERO_ERROR;
    std::u16string text(4 * bytes.size() + 8, u'\0');
    text.resize(static_cast<std::size_t>(
        ucnv_toUChars(converter_.getAlias(), text.data(), static_cast<int32_t>(text.size()),
                      bytes.data(), static_cast<int32_t>(bytes.size()), &error)));
    return U_SUCCESS(error) ? std::optional(text) : std::nullopt;
  }

  Bytes encode(const std::u16string &text) const {
    if (text.empty()) {
      return "";
    }
    UErrorCode error = U_ZERO_ERROR;
    std::string bytes(12 * text.size() + 16, '\0');
    bytes.resize(static_cast<std::size_t>(
        ucnv_fromUChars(converter_.getAlias(), bytes.data(), static_cast<int32_t>(bytes.size()),
                        text.data(), static_cast<int32_t>(text.size()), &error)));
    return U_SUCCESS(error) ? Bytes(bytes) : std::nullopt;
  }

private:
  icu::LocalUConverterPointer converter_;
};

std::size_t cutBlanks(std::u16string &text) {
  std::size_t blanks = 0;
  for (std::size_t end = text.size(); end > 0;) {
    UChar32 last = 0;
    U16_PREV(text.data(), 0, end, last);
    if (last != 0 && !u_isblank(last)) {
      break;
    }
    blanks += last != 0 ? 1 : 0;
    text.resize(end);
  }
  return blanks;
}

// The longest text with blanks, of up to `tried`, that takes at most `most` bytes; 0: no limit.
Bytes withBlanks(const Page &to, std::u16string text, std::size_t tried, std::size_t most) {
  Bytes bytes = to.encode(text);
  for (; bytes && tried > 0 && (most == 0 || bytes->size() != most); --tried) {
    text += u' ';
    const Bytes longer = to.encode(text);
    if (!longer || most == 0 || longer->size() <= most) {
      bytes = longer;
    }
  }
  return bytes;
}

Bytes translated(const Page &from, const Page &to, const std::string &field, Padding padding,
                 std::size_t most) {
  auto text = from.decode(field);
  const std::size_t blanks = !text || padding == Padding::none ? 0 : cutBlanks(*text);
  if (!text || (padding != Padding::none && text->find(u'\0') != std::u16string::npos)) {
    return {};
  }
  const std::size_t tried = padding == Padding::fill ? most : padding == Padding::keep ? blanks : 0;
  Bytes bytes = withBlanks(to, *text, tried, most);
  const bool fits = bytes && (most == 0 || bytes->size() <= most) &&
                    (padding != Padding::fill || bytes->size() == most);
  return fits ? bytes : std::nullopt;
}

struct Field {
  std::size_t begin, length;
  int kind; // a code page; 0 for hex, -1 for raw
  std::size_t width;
};

struct Trial {
  int from, to;
  std::size_t length, outLength = 0, skip = 0, count = 1000;
  Padding padding;
  OnError onError;
  bool verify, newline, csv = false;
  std::vector<Field> fields;

  explicit Trial(std::mt19937 &random);
  std::string commandLine() const;
  Bytes record(const std::string &bytes) const;

private:
  Bytes part(const Field &each, const std::string &bytes) const;
  Bytes field(const std::string &bytes, int source, Padding how, std::size_t most) const;
};

Trial::Trial(std::mt19937 &random) {
  const auto page = [&] {
    return std::next(pages.begin(), static_cast<long>(random() % pages.size()))->first;
  };
  from = page();
  to = page();
  length = 1 + random() % 16;
  padding = static_cast<Padding>(random() % 4);
  onError = static_cast<OnError>(random() % 3);
  verify = onError != OnError::replace && random() % 4 == 0;
  newline = random() % 2 == 0;
  if (padding == Padding::fill || random() % 3 == 0) {
    outLength = 1 + random() % 40;
  }
  if (random() % 4 == 0) {
    skip = random() % 5;
    count = random() % 20;
  }
  if (random() % 3 == 0) {
    csv = random() % 3 == 0;
    for (std::size_t i = 1 + random() % 3; i > 0; --i) {
      const std::size_t begin = random() % length;
      const int kinds[] = {from, from, page(), 0, -1};
      const int kind = kinds[random() % (csv ? 4 : 5)];
      const bool wide = kind >= 0 && !csv && random() % 3 == 0;
      fields.push_back(
          {begin, 1 + random() % (length - begin), kind, wide ? random() % 30 + 1 : 0});
    }
  }
  if (csv) {
    to = 1208;
    padding = Padding::strip;
    outLength = 0;
    newline = true;
  }
}

std::string Trial::commandLine() const {
  constexpr const char *paddings[] = {"", " --strip", " --fill", " --keep-blanks"};
  constexpr const char *treatments[] = {"", " --on-error replace",
                                        " --on-error reject --rejects bad"};
  std::ostringstream line;
  line << "translate --from " << from << " --to " << to << " --record-length " << length
       << paddings[static_cast<int>(padding)] << treatments[static_cast<int>(onError)]
       << (verify ? " --verify" : "")
       << (csv       ? " --csv"
           : newline ? " --newline lf"
                     : "")
       << " --skip " << skip << " --count " << count;
  if (outLength != 0) {
    line << " --out-length " << outLength;
  }
  for (const Field &each : fields) {
    line << (&each == fields.data() ? " --fields " : ",") << each.begin + 1 << "-"
         << each.begin + each.length;
    line << (each.kind == 0 ? "=hex" : each.kind < 0 ? "=raw" : "=" + std::to_string(each.kind));
    line << (each.width != 0 ? ":" + std::to_string(each.width) : "");
  }
  return line.str() + " in";
}

Bytes Trial::field(const std::string &bytes, int source, Padding how, std::size_t most) const {
  const bool replaces = onError == OnError::replace;
  const Page there(source, replaces);
  const Page here(to, replaces);
  Bytes result = translated(there, here, bytes, how, most);
  if (result && verify) {
    const bool padded = how != Padding::none;
    const Bytes back = translated(here, there, *result, padded ? Padding::fill : Padding::none,
                                  padded ? bytes.size() : 0);
    result = back == bytes ? result : std::nullopt;
  }
  return result;
}

std::string hexOf(const std::string &bytes) {
  std::string text;
  for (const char each : bytes) {
    const auto byte = static_cast<unsigned char>(each);
    text += {"0123456789ABCDEF"[byte >> 4], "0123456789ABCDEF"[byte & 15]};
  }
  return text;
}

std::string csvField(const std::string &field) {
  std::string text = "\"";
  for (const char byte : field) {
    text += byte == '"' ? "\"\"" : std::string(1, byte);
  }
  return field.find_first_of(",\"\r\n") == std::string::npos ? field : text + "\"";
}

Bytes Trial::part(const Field &each, const std::string &bytes) const {
  if (each.kind < 0) {
    return bytes;
  }
  if (each.kind == 0) {
    const Padding how = each.width != 0 ? Padding::fill : Padding::none;
    return translated(Page(1208, false), Page(to, false), hexOf(bytes), how, each.width);
  }
  return field(bytes, each.kind, each.width != 0 ? Padding::fill : padding,
               each.width != 0 ? each.width : outLength);
}

Bytes Trial::record(const std::string &bytes) const {
  Bytes whole = fields.empty() ? field(bytes, from, padding, outLength) : Bytes("");
  for (const Field &each : fields) {
    const Bytes made = part(each, bytes.substr(each.begin, each.length));
    if (!made) {
      return {};
    }
    *whole += (csv && &each != fields.data() ? "," : "") + (csv ? csvField(*made) : *made);
  }
  if (whole && newline) {
    const Page here(to, false); // a line feed after text has no signature
    *whole += here.encode(u"A\n")->substr(here.encode(u"A")->size());
  }
  return whole;
}

// Half of them text of the page, as long as it must be, with blanks of all kinds at the end.
std::string randomRecord(std::mt19937 &random, const Page &page, std::size_t length) {
  const std::u16string letters = u"AZaz09,\"\näß€Жあ日語\u3000 \t\0\U0001F600"s;
  std::string bytes;
  if (random() % 2 == 0) {
    std::u16string text;
    for (std::size_t i = random() % (length + 1); i > 0; --i) {
      text += letters[random() % letters.size()];
    }
    bytes = page.encode(text).value_or("");
    while (bytes.size() < length) {
      text += u"  \t\0"[random() % 4];
      bytes = page.encode(text).value_or("");
    }
  }
  while (bytes.size() < length) {
    bytes += static_cast<char>(random());
  }
  return bytes.substr(0, length);
}

void expectLikeIcu(std::mt19937 &random) {
  const Trial trial(random);
  SCOPED_TRACE(trial.commandLine());
  std::string input, out, bad, failed;
  const Page source(trial.from, true);
  for (std::size_t i = 0; i < 30; ++i) {
    const std::string record = randomRecord(random, source, trial.length);
    input += record;
    if (i < trial.skip || i >= trial.skip + trial.count ||
        (!failed.empty() && trial.onError != OnError::reject)) {
      continue;
    }
    const Bytes result = trial.record(record);
    out += result.value_or("");
    bad += result ? "" : record;
    if (!result && failed.empty()) {
      failed = "record " + std::to_string(i + 1) + " at byte " + std::to_string(i * trial.length);
    }
  }
  const TempDir dir;
  writeFile(dir.path("in"), input);
  const Result result = runTool(trial.commandLine(), "", dir.path("."));
  EXPECT_EQ(result.exitCode, failed.empty() ? 0 : 1) << result.err;
  EXPECT_EQ(result.out, out);
  EXPECT_NE(result.err.find(failed), std::string::npos) << failed << result.err;
  EXPECT_EQ(readFile(dir.path("bad")), trial.onError == OnError::reject ? bad : "");
}

TEST(Translate, IsLikeIcuForRandomPagesAndOptions) {
  std::mt19937 random(20260229);
  for (int i = 0; i < 400 && !HasFailure(); ++i) {
    expectLikeIcu(random);
  }
}

} // namespace

} // namespace tools
