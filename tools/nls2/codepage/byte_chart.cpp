// What each single byte of a code page means, and where two pages differ in it.

#include "codepage/byte_chart.h"

#include "codepage/display.h"
#include "errors.h"

#include <algorithm>

namespace nls2::tool {

namespace {

ByteMeaning meaningOf(UConverter *converter, char byte) {
  std::array<char16_t, 32> units;
  char16_t *end = units.data();
  const char *source = &byte;
  UErrorCode error = U_ZERO_ERROR;
  ucnv_reset(converter);
  ucnv_toUnicode(converter, &end, units.data() + units.size(), &source, &byte + 1, nullptr, 0,
                 &error);
  if (U_FAILURE(error)) {
    return {ByteMeaning::none, {}};
  }
  if (end != units.data()) {
    return {ByteMeaning::character, {units.data(), end}};
  }
  const bool isPending = ucnv_toUCountPending(converter, &error) > 0;
  return {isPending ? ByteMeaning::leadByte : ByteMeaning::shift, {}};
}

const char *nameOf(ByteMeaning::Kind kind) {
  constexpr std::array names{"character", "lead byte", "shift", "none"};
  return names[kind];
}

// Two columns, so that no mark can be taken for a character.
std::string cellOf(const ByteMeaning &meaning) {
  constexpr std::array marks{"", ">>", "<>", "--"};
  if (meaning.kind != ByteMeaning::character) {
    return marks[meaning.kind];
  }
  if (meaning.text == u" ") {
    return "SP";
  }
  const Display display = displayOf(meaning.text);
  if (display.text == "." && meaning.text != u".") {
    return "..";
  }
  return display.text +
         std::string(static_cast<std::size_t>(std::max(0, 2 - display.columns)), ' ');
}

Json characterAsJson(const ByteMeaning &meaning) {
  if (meaning.kind != ByteMeaning::character) {
    return {};
  }
  return codePointsOf(meaning.text);
}

std::string characterAsText(const ByteMeaning &meaning) {
  return meaning.kind == ByteMeaning::character
             ? displayOf(meaning.text).text + " " + codePointsOf(meaning.text)
             : "-";
}

template <class Visit>
void forEachDifference(const ByteChart &a, const ByteChart &b, Visit visit) {
  for (std::size_t byte = 0; byte < a.bytes.size(); ++byte) {
    if (a.bytes[byte].text != b.bytes[byte].text) {
      visit(byte, a.bytes[byte], b.bytes[byte]);
    }
  }
}

} // namespace

ByteChart chartOf(const CodePage &page) {
  ByteChart chart;
  chart.page = page.number();
  UErrorCode error = U_ZERO_ERROR;
  ucnv_setToUCallBack(page.converter(), UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
  for (std::size_t byte = 0; byte < chart.bytes.size(); ++byte) {
    chart.bytes[byte] = meaningOf(page.converter(), static_cast<char>(byte));
  }
  if (std::none_of(chart.bytes.begin(), chart.bytes.end(), [](const ByteMeaning &meaning) {
        return meaning.kind == ByteMeaning::character;
      })) {
    throw failure("code page {} has no characters of one byte", page.number());
  }
  return chart;
}

std::string chartAsText(const ByteChart &chart) {
  std::string text = "   0  1  2  3  4  5  6  7  8  9  A  B  C  D  E  F\n";
  for (std::size_t row = 0; row < 16; ++row) {
    std::string line = fmt::format("{:X} ", row);
    for (std::size_t column = 0; column < 16; ++column) {
      line += " " + cellOf(chart.bytes[16 * row + column]);
    }
    text += line.substr(0, line.find_last_not_of(' ') + 1) + "\n";
  }
  return text + "SP blank, .. does not print, >> lead byte, <> shift, -- no character\n";
}

Json chartAsJson(const ByteChart &chart) {
  Json rows = Json::array();
  for (std::size_t byte = 0; byte < chart.bytes.size(); ++byte) {
    const ByteMeaning &meaning = chart.bytes[byte];
    Json row = Json::object();
    row.set("byte", fmt::format("{:02X}", byte)).set("kind", nameOf(meaning.kind));
    row.set("character", characterAsJson(meaning));
    rows.append(std::move(row));
  }
  Json result = Json::object();
  result.set("codepage", chart.page).set("bytes", std::move(rows));
  return result;
}

std::string differenceAsText(const ByteChart &a, const ByteChart &b) {
  std::string text;
  forEachDifference(a, b, [&](std::size_t byte, const ByteMeaning &x, const ByteMeaning &y) {
    text += fmt::format("{:02X}  {}  {}\n", byte, characterAsText(x), characterAsText(y));
  });
  return text;
}

Json differenceAsJson(const ByteChart &a, const ByteChart &b) {
  Json rows = Json::array();
  forEachDifference(a, b, [&](std::size_t byte, const ByteMeaning &x, const ByteMeaning &y) {
    Json row = Json::object();
    row.set("byte", fmt::format("{:02X}", byte));
    row.set("first", characterAsJson(x)).set("second", characterAsJson(y));
    rows.append(std::move(row));
  });
  Json pages = Json::array();
  pages.append(a.page).append(b.page);
  Json result = Json::object();
  result.set("codepages", std::move(pages));
  result.set("differences", std::move(rows));
  return result;
}

} // namespace nls2::tool
