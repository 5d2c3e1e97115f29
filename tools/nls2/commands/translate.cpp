// nls2 translate: its options and its help.

#include "base/options.h"
#include "codepage/code_page.h"
#include "convert/translate_options.h"

#include <algorithm>
#include <fmt/format.h>
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

struct Arguments {
  TranslateOptions options;
  std::optional<int32_t> to;
  bool lines = false;
  std::optional<std::string> fields;
};

struct Rule {
  bool isBroken;
  const char *message;
};

// The first rule that is broken is the one to report.
void check(const Arguments &arguments) {
  const TranslateOptions &options = arguments.options;
  const bool hasLength = options.recordLength != 0;
  const bool fills = options.padding == nls2::padding::fill;
  const bool keeps = options.padding == nls2::padding::keep_blanks;
  const bool rejects = options.onError == OnError::reject;
  for (const auto &[isBroken, message] : {
           Rule{!arguments.to && !options.csv, "--to PAGE is missing"},
           Rule{hasLength && arguments.lines, "--record-length and --lines exclude each other"},
           Rule{arguments.fields && !hasLength, "--fields needs --record-length"},
           Rule{!hasLength && !arguments.lines, "--record-length N or --lines is missing"},
           Rule{options.csv && arguments.to.value_or(utf8Page) != utf8Page,
                "--csv writes UTF-8: --to must be 1208, or left out"},
           Rule{options.csv && options.newline.value_or(Newline::lf) != Newline::lf,
                "--csv ends its lines in LF: --newline must be lf, or left out"},
           Rule{options.csv && (fills || keeps || options.outLength != 0),
                "--csv strips its fields: --fill, --keep-blanks and --out-length make no sense"},
           Rule{fills && options.outLength == 0 && !arguments.fields, "--fill needs --out-length"},
           Rule{rejects && !options.rejects, "--on-error reject needs --rejects FILE"},
           Rule{!rejects && options.rejects, "--rejects needs --on-error reject"},
       }) {
    if (isBroken) {
      throw usageError("{}", message);
    }
  }
}

int run(Arguments &arguments) {
  check(arguments);
  TranslateOptions &options = arguments.options;
  options.to = arguments.to.value_or(utf8Page);
  if (arguments.fields) {
    options.fields = parseFields(*arguments.fields, options);
  }
  return translateFile(options);
}

template <typename Value>
Take set(Value &value, bool to) {
  return [&value, to](const std::string &) { value = to; };
}

Take set(nls2::padding &padding, nls2::padding chosen) {
  return [&padding, chosen](const std::string &) {
    if (padding != nls2::padding::as_is && padding != chosen) {
      throw usageError("--fill, --keep-blanks and --strip exclude each other");
    }
    padding = chosen;
  };
}

// One of the words of `kinds`, whose numbers are those of the enumerators.
template <typename Kind, typename Target>
Take word(const char *option, Target &target, const std::vector<const char *> &kinds) {
  return [=, &target](const std::string &text) {
    const auto found = std::ranges::find(kinds, text);
    if (found == kinds.end()) {
      throw usageError("{}: \"{}\" is not {} or {}", option, printable(text),
                       fmt::join(kinds.begin(), kinds.end() - 1, ", "), kinds.back());
    }
    target = static_cast<Kind>(found - kinds.begin());
  };
}

std::vector<Option> optionsOf(Arguments &arguments) {
  constexpr uint64_t longest = 1 << 30;
  constexpr uint64_t most = std::numeric_limits<int64_t>::max();
  TranslateOptions &options = arguments.options;
  return {
      required(pageValue("from", "code page of the input", options.from)),
      pageValue("to", "code page of the output; required but for --csv", arguments.to),
      numberValue("record-length", "N", "bytes of every input record", options.recordLength, 1,
                  longest),
      flag("lines", "read lines that end in LF, CR LF or NEL in place of records",
           into(arguments.lines)),
      numberValue("skip", "N", "leave out the first N records", options.skip, 0, most),
      numberValue("count", "M", "translate M records at the most", options.count, 0, most),
      value("fields", "LIST", "START-END[=KIND][:WIDTH],...: the bytes of a record to put out",
            into(arguments.fields)),
      numberValue("out-length", "M", "the most bytes of an output record", options.outLength, 1,
                  longest),
      flag("fill", "pad with blanks to M bytes", set(options.padding, nls2::padding::fill)),
      flag("keep-blanks", "keep the trailing blanks, or as many as fit in M",
           set(options.padding, nls2::padding::keep_blanks)),
      flag("strip", "drop trailing blanks", set(options.padding, nls2::padding::strip)),
      value("newline", "KIND", "what ends every output record: none, lf, crlf or nel",
            word<Newline>("--newline", options.newline, {"none", "lf", "crlf", "nel"})),
      flag("csv", "write comma-separated values in UTF-8", into(options.csv)),
      value("on-error", "WHAT", "stop (the default), replace characters or reject records",
            word<OnError>("--on-error", options.onError, {"stop", "replace", "reject"})),
      value("rejects", "FILE", "where rejected records go", into(options.rejects)),
      flag("verify", "translate every record back and compare", into(options.verify)),
      flag("dry-run", "write no output", into(options.dryRun)),
      value("report", "FILE", "write what was done as JSON", into(options.report)),
      flag("progress", "show how far the run is; the default on a terminal",
           set(options.progress, true)),
      flag("no-progress", "do not show it", set(options.progress, false)),
      value("output", "OUT", "file to write; standard output if - or not given",
            into(options.output), 'o'),
      flag("sync", "wait until the disk has it", into(options.sync)),
  };
}

} // namespace

Command translateCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {.operands = {{"INPUT", "file to read; standard input if - or not given",
                        into(arguments->options.input)}},
          .options = optionsOf(*arguments),
          .notes = notes,
          .run = [arguments] { return run(*arguments); }};
}

} // namespace nls2::tool
