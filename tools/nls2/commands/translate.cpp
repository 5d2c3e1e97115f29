// nls2 translate: its options and its help.

#include "codepage/code_page.h"
#include "commands.h"
#include "convert/translate_run.h"

#include <charconv>
#include <memory>
#include <string>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(Each record, line or field is translated on its own. Under --fill, --keep-blanks and --strip the
blanks and nulls at its end are cut off, and blanks (U+0020) are put back as the option says; a null
inside the text is refused. Nothing is lost in silence: what cannot be translated ends the run, or
is treated as --on-error says. An output file appears only when it is complete.
)";

constexpr int32_t longest = 1 << 30;

struct Arguments {
  TranslateOptions options;
  bool hasTo = false;
  bool lines = false;
  std::optional<std::string> fields;
};

std::size_t parseLength(const char *option, const std::string &text) {
  return static_cast<std::size_t>(parseNumber(option, text, 1, longest));
}

uint64_t parseCount(const char *option, const std::string &text) {
  constexpr uint64_t most = std::numeric_limits<int64_t>::max();
  uint64_t number = 0;
  const char *end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, number);
  if (error != std::errc() || stop != end || number > most) {
    throw usageError("{}: \"{}\" is not a number from 0 to {}", option, printable(text), most);
  }
  return number;
}

void choosePadding(nls2::padding &padding, nls2::padding chosen) {
  if (padding != nls2::padding::as_is && padding != chosen) {
    throw usageError("--fill, --keep-blanks and --strip exclude each other");
  }
  padding = chosen;
}

Newline parseNewline(const std::string &text) {
  if (text == "none") {
    return Newline::none;
  }
  if (text == "lf") {
    return Newline::lf;
  }
  if (text == "crlf") {
    return Newline::crlf;
  }
  if (text == "nel") {
    return Newline::nel;
  }
  throw usageError("--newline: \"{}\" is not none, lf, crlf or nel", printable(text));
}

OnError parseOnError(const std::string &text) {
  if (text == "stop") {
    return OnError::stop;
  }
  if (text == "replace") {
    return OnError::replace;
  }
  if (text == "reject") {
    return OnError::reject;
  }
  throw usageError("--on-error: \"{}\" is not stop, replace or reject", printable(text));
}

void checkInput(const Arguments &arguments) {
  const bool hasLength = arguments.options.recordLength != 0;
  if (hasLength && arguments.lines) {
    throw usageError("--record-length and --lines exclude each other");
  }
  if (arguments.fields && !hasLength) {
    throw usageError("--fields needs --record-length");
  }
  if (!hasLength && !arguments.lines) {
    throw usageError("--record-length N or --lines is missing");
  }
}

void checkCsv(const Arguments &arguments) {
  const TranslateOptions &options = arguments.options;
  if (options.to != utf8Page) {
    throw usageError("--csv writes UTF-8: --to must be 1208, or left out");
  }
  if (options.newline.value_or(Newline::lf) != Newline::lf) {
    throw usageError("--csv ends its lines in LF: --newline must be lf, or left out");
  }
  if (options.padding == nls2::padding::fill || options.padding == nls2::padding::keep_blanks ||
      options.outLength != 0) {
    throw usageError("--csv strips its fields: --fill, --keep-blanks and --out-length make no "
                     "sense");
  }
}

void checkFiles(const TranslateOptions &options) {
  if (options.onError == OnError::reject && options.rejects.empty()) {
    throw usageError("--on-error reject needs --rejects FILE");
  }
  if (options.onError != OnError::reject && !options.rejects.empty()) {
    throw usageError("--rejects needs --on-error reject");
  }
  const std::string output = options.dryRun ? "" : options.output;
  if (!options.rejects.empty() &&
      (options.rejects == output || options.rejects == options.report)) {
    throw usageError("--rejects names a file that is written already");
  }
  if (!options.report.empty() && options.report == output) {
    throw usageError("--report names a file that is written already");
  }
}

int run(Arguments &arguments) {
  TranslateOptions &options = arguments.options;
  if (!arguments.hasTo) {
    if (!options.csv) {
      throw usageError("--to PAGE is missing");
    }
    options.to = utf8Page;
  }
  checkInput(arguments);
  if (options.csv) {
    checkCsv(arguments);
  }
  if (options.padding == nls2::padding::fill && options.outLength == 0 && !arguments.fields) {
    throw usageError("--fill needs --out-length");
  }
  checkFiles(options);
  if (arguments.fields) {
    options.fields =
        parseFields(*arguments.fields, options.recordLength, options.from, options.csv);
  }
  return translateFile(options);
}

std::vector<Option> pageOptions(Arguments &arguments) {
  TranslateOptions &options = arguments.options;
  return {{.name = "from",
           .metavar = "PAGE",
           .help = "code page of the input",
           .take = [&](const std::string &text) { options.from = parsePage("--from", text); },
           .isRequired = true},
          {.name = "to",
           .metavar = "PAGE",
           .help = "code page of the output; required but for --csv",
           .take = [&](const std::string &text) {
             options.to = parsePage("--to", text);
             arguments.hasTo = true;
           }}};
}

std::vector<Option> inputOptions(Arguments &arguments) {
  TranslateOptions &options = arguments.options;
  return {{.name = "record-length",
           .metavar = "N",
           .help = "bytes of every input record",
           .take =
               [&](const std::string &text) {
                 options.recordLength = parseLength("--record-length", text);
               }},
          {.name = "lines",
           .help = "read lines that end in LF, CR LF or NEL in place of records",
           .take = into(arguments.lines)},
          {.name = "skip",
           .metavar = "N",
           .help = "leave out the first N records",
           .take = [&](const std::string &text) { options.skip = parseCount("--skip", text); }},
          {.name = "count",
           .metavar = "M",
           .help = "translate M records at the most",
           .take = [&](const std::string &text) { options.count = parseCount("--count", text); }},
          {.name = "fields",
           .metavar = "LIST",
           .help = "START-END[=KIND][:WIDTH],...: the bytes of a record to put out",
           .take = [&](const std::string &text) { arguments.fields = text; }}};
}

std::vector<Option> shapeOptions(TranslateOptions &options) {
  const auto padding = [&](nls2::padding chosen) {
    return [&options, chosen](const std::string &) { choosePadding(options.padding, chosen); };
  };
  return {
      {.name = "out-length",
       .metavar = "M",
       .help = "the most bytes of an output record",
       .take =
           [&](const std::string &text) { options.outLength = parseLength("--out-length", text); }},
      {.name = "fill", .help = "pad with blanks to M bytes", .take = padding(nls2::padding::fill)},
      {.name = "keep-blanks",
       .help = "keep the trailing blanks, or as many as fit in M",
       .take = padding(nls2::padding::keep_blanks)},
      {.name = "strip", .help = "drop trailing blanks", .take = padding(nls2::padding::strip)},
      {.name = "newline",
       .metavar = "KIND",
       .help = "what ends every output record: none, lf, crlf or nel",
       .take = [&](const std::string &text) { options.newline = parseNewline(text); }},
      {.name = "csv", .help = "write comma-separated values in UTF-8", .take = into(options.csv)}};
}

std::vector<Option> safetyOptions(TranslateOptions &options) {
  return {{.name = "on-error",
           .metavar = "WHAT",
           .help = "stop (the default), replace characters or reject records",
           .take = [&](const std::string &text) { options.onError = parseOnError(text); }},
          {.name = "rejects",
           .metavar = "FILE",
           .help = "where rejected records go",
           .take = into(options.rejects)},
          {.name = "verify",
           .help = "translate every record back and compare",
           .take = into(options.verify)},
          {.name = "dry-run", .help = "write no output", .take = into(options.dryRun)},
          {.name = "report",
           .metavar = "FILE",
           .help = "write what was done as JSON",
           .take = into(options.report)},
          {.name = "progress",
           .help = "show how far the run is; the default on a terminal",
           .take = [&](const std::string &) { options.progress = true; }},
          {.name = "no-progress",
           .help = "do not show it",
           .take = [&](const std::string &) { options.progress = false; }},
          {.name = "output",
           .letter = 'o',
           .metavar = "OUT",
           .help = "file to write; standard output if - or not given",
           .take = into(options.output)},
          {.name = "sync", .help = "wait until the disk has it", .take = into(options.sync)}};
}

} // namespace

Command translateCommand() {
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {{.metavar = "INPUT",
                       .help = "file to read; standard input if - or not given",
                       .take = into(arguments->options.input)}};
  for (auto &group : {pageOptions(*arguments), inputOptions(*arguments),
                      shapeOptions(arguments->options), safetyOptions(arguments->options)}) {
    command.options.insert(command.options.end(), group.begin(), group.end());
  }
  command.notes = notes;
  command.run = [arguments] { return run(*arguments); };
  return command;
}

} // namespace nls2::tool
