// nls2 sort: sorts lines or records by the rules of a language.

#include "base/options.h"
#include "io/output_file.h"
#include "text/record_source.h"
#include "text/text_order.h"

#include <cstring>
#include <endian.h>
#include <memory>
#include <memory_resource>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(Case, accents and punctuation count; equal lines keep their order. FORMAT is lines (the default: LF,
CR LF and NEL end them, and stay at theirs; a last line without one gets that of the line before) or
fixed:N. If a line has invalid bytes, nothing is written. All lines are kept in memory. OUT may be one of the FILEs.
)";

struct Arguments {
  OrderOptions order;
  std::string format = "lines";
  std::vector<std::string> inputs;
  std::string output = "-";
};

// A line with its sort key. Most comparisons need only the first bytes of the keys, which are kept
// side by side.
struct KeyedLine {
  uint64_t prefix;   // the first bytes of the key, as a number
  const char *bytes; // the key, and after it the line with its end
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
  // Copies all.
  void add(std::string_view line, std::string_view end, std::string_view key) {
    const std::size_t length = line.size() + end.size();
    auto *const bytes = static_cast<char *>(memory_.allocate(key.size() + length, 1));
    char *next = bytes;
    for (const std::string_view part : {key, line, end}) {
      next += part.copy(next, part.size());
    }
    uint64_t prefix = 0;
    std::memcpy(&prefix, key.data(), std::min(key.size(), sizeof prefix));
    lines_.push_back(
        {be64toh(prefix), bytes, static_cast<uint32_t>(key.size()), static_cast<uint32_t>(length)});
  }

  // Sorts the lines; those with equal keys keep the order in which they were added.
  const std::vector<KeyedLine> &sorted() {
    std::stable_sort(lines_.begin(), lines_.end());
    return lines_;
  }

private:
  std::pmr::monotonic_buffer_resource memory_{std::size_t{1} << 20};
  std::vector<KeyedLine> lines_;
};

int sortFiles(const Arguments &arguments) {
  const CodePage &page = arguments.order.locale.codepage;
  TextOrder order(arguments.order, page);
  std::string end = lineEnd(arguments.format, page);
  Lines lines;
  for (const std::string &path : inputsOf(arguments.inputs)) {
    RecordFile file(path, {.format = arguments.format, .page = page});
    while (const auto line = file.next()) {
      end = line->end.empty() ? end : line->end;
      lines.add(line->text, end, file.apply(*line, [&](auto text) { return order.keyOf(text); }));
    }
  }
  OutputFile output(arguments.output);
  for (const KeyedLine &each : lines.sorted()) {
    output.put(each.line());
  }
  output.commit();
  return exitDone;
}

} // namespace

Command sortCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {.operands = {{"FILE", "input files; standard input if - or not given",
                        into(arguments->inputs), 0, Operand::anyNumber}},
          .options =
              orderOptions(arguments->order,
                           {linesOrFixed(arguments->format),
                            value("output", "OUT", "output file; standard output if - or not given",
                                  into(arguments->output), 'o')}),
          .notes = notes,
          .run = [arguments] { return sortFiles(*arguments); }};
}

} // namespace nls2::tool
