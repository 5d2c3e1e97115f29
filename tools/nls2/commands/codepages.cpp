// nls2 codepages: the code page numbers and names of the library, facts about one page, charts, and
// the difference of two pages.

#include "base/options.h"
#include "codepage/display.h"
#include "codepage/page_lookup.h"
#include "codepage/page_text.h"
#include "io/output_file.h"

#include <algorithm>
#include <array>
#include <memory>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(Digits are a number of the library; anything else is a name that ICU opens. Without PAGE, the
numbers that are opened by name and all Windows names are listed. In a chart, the row is the first
hex digit of a byte and the column the second.
)";

struct Arguments {
  std::vector<std::string> pages;
  bool asChart = false;
  bool asDifference = false;
  bool asNames = false;
  bool asJson = false;
};

struct ByteMeaning {
  Meaning kind;
  std::u16string text; // of a character; empty for all else
};

// The meaning of each single byte of a code page.
struct ByteChart {
  std::string page;
  std::vector<ByteMeaning> bytes;
};

// Throws Error if the page does not open or has no single-byte characters.
ByteChart chartOf(const char *option, const std::string &name) {
  const CodePage page(option, name);
  PageText text(page);
  ByteChart chart{page.name(), {}};
  for (int byte = 0; byte < 256; ++byte) {
    const PageText::Piece piece = text.meaningOf(static_cast<char>(byte));
    chart.bytes.push_back({piece.meaning, fromUtf8(piece.text)});
  }
  if (std::ranges::all_of(chart.bytes, &std::u16string::empty, &ByteMeaning::text)) {
    throw failure("code page {} has no single-byte characters", page.name());
  }
  return chart;
}

// Two columns wide, so that no mark looks like a character.
std::string cellOf(const ByteMeaning &meaning) {
  constexpr std::array marks{"", "<>", ">>", "--"};
  if (meaning.text.empty()) {
    return marks[static_cast<std::size_t>(meaning.kind)];
  }
  if (meaning.text == u" ") {
    return "SP";
  }
  const Display display = displayOf(meaning.text);
  if ((display.text == "." && meaning.text != u".") || u_isblank(meaning.text[0])) {
    return "..";
  }
  return display.text +
         std::string(static_cast<std::size_t>(std::max(0, 2 - display.columns)), ' ');
}

Json jsonOf(const ByteMeaning &meaning) {
  return meaning.text.empty() ? Json() : Json(codePointsOf(meaning.text));
}

Answer chart(const std::string &name) {
  const ByteChart chart = chartOf("--chart", name);
  std::string text = "   0  1  2  3  4  5  6  7  8  9  A  B  C  D  E  F\n";
  constexpr std::array kinds{"character", "shift", "lead byte", "none"};
  Json rows = Json::array();
  for (std::size_t row = 0; row < 256; row += 16) {
    std::string line = fmt::format("{:X} ", row / 16);
    for (std::size_t byte = row; byte < row + 16; ++byte) {
      const ByteMeaning &meaning = chart.bytes[byte];
      line.append(1, ' ').append(cellOf(meaning));
      rows.append(Json::object({{"byte", fmt::format("{:02X}", byte)},
                                {"kind", kinds[static_cast<std::size_t>(meaning.kind)]},
                                {"character", jsonOf(meaning)}}));
    }
    text += line.substr(0, line.find_last_not_of(' ') + 1) + "\n";
  }
  text += "SP blank, .. not printable, >> lead byte, <> shift, -- no character\n";
  return {text, Json::object({{"codepage", chart.page}, {"bytes", rows}})};
}

Answer difference(const std::string &first, const std::string &second) {
  const ByteChart a = chartOf("--diff", first);
  const ByteChart b = chartOf("--diff", second);
  const auto shown = [](const ByteMeaning &meaning) {
    return meaning.text.empty() ? "-"
                                : displayOf(meaning.text).text + " " + codePointsOf(meaning.text);
  };
  std::string text;
  Json rows = Json::array();
  for (std::size_t i = 0; i < a.bytes.size(); ++i) {
    if (a.bytes[i].text != b.bytes[i].text) {
      const std::string byte = fmt::format("{:02X}", i);
      text += fmt::format("{}  {}  {}\n", byte, shown(a.bytes[i]), shown(b.bytes[i]));
      rows.append(Json::object(
          {{"byte", byte}, {"first", jsonOf(a.bytes[i])}, {"second", jsonOf(b.bytes[i])}}));
    }
  }
  return {text, Json::object({{"codepages", Json::array(std::array{a.page, b.page})},
                              {"differences", rows}})};
}

// The answer to the options, for the pages given.
Answer answer(const Arguments &arguments) {
  const auto &pages = arguments.pages;
  if (arguments.asChart + arguments.asDifference + arguments.asNames > 1) {
    throw usageError("--chart, --diff and --names cannot be combined");
  }
  if (arguments.asDifference && pages.size() != 2) {
    throw usageError("--diff needs two PAGEs");
  }
  const std::size_t most = arguments.asDifference ? 2 : arguments.asNames ? 0 : 1;
  if (pages.size() > most) {
    throw usageError("extra operand {}", printable(pages[most]));
  }
  if (arguments.asChart && pages.empty()) {
    throw usageError("--chart needs a PAGE");
  }
  if (arguments.asNames) {
    return allPageNames();
  }
  return arguments.asDifference ? difference(pages[0], pages[1])
         : arguments.asChart    ? chart(pages[0])
         : pages.empty()        ? allPages()
                                : lookUpPage(pages[0]);
}

} // namespace

Command codepagesCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {.operands = {{"PAGE", "number or name to look up", into(arguments->pages), 0, 2}},
          .options = {flag("chart", "show what every byte of PAGE means", into(arguments->asChart)),
                      flag("diff", "show the bytes that differ between two PAGEs",
                           into(arguments->asDifference)),
                      flag("names", "list the names that options accept as a PAGE",
                           into(arguments->asNames)),
                      flag("json", "write JSON", into(arguments->asJson))},
          .notes = notes,
          .run = [arguments] { return print(answer(*arguments).rendered(arguments->asJson)); }};
}

} // namespace nls2::tool
