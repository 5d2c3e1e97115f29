// nls2 translate: the options and their help.

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
    R"(Each record, line or field is translated separately. --fill, --keep-blanks and --strip remove the
blanks and nulls at its end, then add blanks (U+0020) as the option requires; a null inside the text
is an error. Nothing is lost silently: text that cannot be translated ends the run, unless --on-error
replaces or rejects it. An output file appears only when it is complete.
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

// Reports the first rule that is broken.
void check(const Arguments &arguments) {
  const TranslateOptions &options = arguments.options;
  const bool hasLength = options.recordLength != 0;
  const bool fills = options.padding == nls2::padding::fill;
  const bool keeps = options.padding == nls2::padding::keep_blanks;
  const bool rejects = options.onError == OnError::reject;
  for (const auto &[isBroken, message] : {
           Rule{!arguments.to && !options.csv, "--to PAGE is missing"},
           Rule{hasLength && arguments.lines, "--record-length and --lines cannot be combined"},
           Rule{arguments.fields && !hasLength, "--fields needs --record-length"},
           Rule{!hasLength && !arguments.lines, "--record-length N or --lines is missing"},
           Rule{options.csv && arguments.to.value_or(utf8Page) != utf8Page,
                "--csv writes UTF-8, so --to must be 1208 or omitted"},
           Rule{options.csv && options.newline.value_or(Newline::lf) != Newline::lf,
                "--csv ends lines in LF, so --newline must be lf or omitted"},
           Rule{
               options.csv && (fills || keeps || options.outLength != 0),
               "--csv strips its fields, so --fill, --keep-blanks and --out-length cannot be used"},
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
      throw usageError("--fill, --keep-blanks and --strip cannot be combined");
    }
    padding = chosen;
  };
}

// Takes one of the words in `kinds`, which are in the order of the enumerators.
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
      pageValue("to", "code page of the output; not needed with --csv", arguments.to),
      numberValue("record-length", "N", "length of every input record, in bytes",
                  options.recordLength, 1, longest),
      flag("lines", "read lines, ended by LF, CR LF or NEL, instead of records",
           into(arguments.lines)),
      numberValue("skip", "N", "skip the first N records", options.skip, 0, most),
      numberValue("count", "M", "translate at most M records", options.count, 0, most),
      value("fields", "LIST", "START-END[=KIND][:WIDTH],...: parts of a record to write",
            into(arguments.fields)),
      numberValue("out-length", "M", "maximum length of an output record, in bytes",
                  options.outLength, 1, longest),
      flag("fill", "pad with blanks to M bytes", set(options.padding, nls2::padding::fill)),
      flag("keep-blanks", "keep trailing blanks, as many as fit in M bytes",
           set(options.padding, nls2::padding::keep_blanks)),
      flag("strip", "drop trailing blanks", set(options.padding, nls2::padding::strip)),
      value("newline", "KIND", "end of every output record: none, lf, crlf or nel",
            word<Newline>("--newline", options.newline, {"none", "lf", "crlf", "nel"})),
      flag("csv", "write comma-separated values in UTF-8", into(options.csv)),
      value("on-error", "WHAT", "stop (the default), replace characters or reject records",
            word<OnError>("--on-error", options.onError, {"stop", "replace", "reject"})),
      value("rejects", "FILE", "file for rejected records", into(options.rejects)),
      flag("verify", "translate every record back and compare", into(options.verify)),
      flag("dry-run", "write no output", into(options.dryRun)),
      value("report", "FILE", "write a summary of the run as JSON", into(options.report)),
      flag("progress", "show progress; the default on a terminal", set(options.progress, true)),
      flag("no-progress", "do not show progress", set(options.progress, false)),
      value("output", "OUT", "output file; standard output if - or not given", into(options.output),
            'o'),
      flag("sync", "wait until the output is on disk", into(options.sync)),
  };
}

} // namespace

Command translateCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {.operands = {{"INPUT", "input file; standard input if - or not given",
                        into(arguments->options.input)}},
          .options = optionsOf(*arguments),
          .notes = notes,
          .run = [arguments] { return run(*arguments); }};
}

} // namespace nls2::tool
