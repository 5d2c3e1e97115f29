// nls2 translate: the options and their help.

#include "base/options.h"
#include "convert/translate_options.h"

#include <algorithm>
#include <fmt/format.h>
#include <memory>
#include <string>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(FORMAT is fixed:N, lines[:lf|:crlf|:nel], prefixed[:data][:little], blocked (read), csv (UTF-8) or
joined (write). Fixed records are filled with blanks; lines, prefixed records and CSV have no blanks
at the end. A layout describes the fields of the records; the other side is CSV, or records with the
same fields. Nothing is lost silently: text that cannot be translated ends the run, unless --on-error
replaces or rejects it. An output file appears only when it is complete.
)";

struct Rule {
  bool isBroken;
  const char *message;
};

// Reports the first rule that is broken.
void check(const TranslateOptions &options) {
  const bool rejects = options.onError == OnError::reject;
  for (const auto &[isBroken, message] : {
           Rule{options.layout && options.fields, "--layout and --fields cannot be combined"},
           Rule{rejects && !options.rejects, "--on-error reject needs --rejects FILE"},
           Rule{!rejects && options.rejects, "--rejects needs --on-error reject"},
       }) {
    if (isBroken) {
      throw usageError("{}", message);
    }
  }
}

// Takes one of the words in `kinds`, which are in the order of the enumerators.
template <typename Target>
Take word(const char *option, Target &target, const std::vector<const char *> &kinds) {
  return [=, &target](const std::string &text) {
    const auto found = std::ranges::find(kinds, text);
    if (found == kinds.end()) {
      throw usageError("{}: \"{}\" is not {}", option, printable(text), fmt::join(kinds, " or "));
    }
    target = static_cast<Target>(found - kinds.begin());
  };
}

std::vector<Option> optionsOf(TranslateOptions &options) {
  constexpr uint64_t most = std::numeric_limits<int64_t>::max();
  return {
      required(value("read", "FORMAT", "how the input's records are framed", into(options.read))),
      required(
          value("write", "FORMAT", "how the output's records are framed", into(options.write))),
      pageValue("from", "code page of the input; not needed with --read csv", options.from),
      pageValue("to", "code page of the output; not needed with --write csv", options.to),
      value("layout", "FILE", "the fields of the records, a line each", into(options.layout)),
      value("fields", "LIST", "the same in brief: START-END[=KIND][:OPTION];...",
            into(options.fields)),
      value("blanks", "keep", "keep the blanks at the ends of texts",
            [&](const std::string &text) {
              options.keepsBlanks = text == "keep";
              if (!options.keepsBlanks) {
                throw usageError("--blanks: \"{}\" is not keep", printable(text));
              }
            }),
      numberValue("skip", "N", "skip the first N records", options.skip, 0, most),
      numberValue("count", "M", "translate at most M records", options.count, 0, most),
      value("on-error", "WHAT", "stop (the default), replace characters or reject records",
            word("--on-error", options.onError, {"stop", "replace", "reject"})),
      value("rejects", "FILE", "file for rejected records", into(options.rejects)),
      value("problems", "FILE", "write each problem as a line of JSON", into(options.problems)),
      numberValue("problems-limit", "N", "at most N of them; 10000 by default",
                  options.problemsLimit, 0, most),
      flag("verify", "translate every record back and compare", into(options.verify)),
      flag("dry-run", "write no output", into(options.dryRun)),
      value("report", "FILE", "write a summary of the run as JSON", into(options.report)),
      flag("progress", "show progress; the default on a terminal", into(options.progress)),
      value("output", "OUT", "output file; standard output if - or not given", into(options.output),
            'o'),
      flag("sync", "wait until the output is on disk", into(options.sync)),
  };
}

} // namespace

Command translateCommand() {
  const auto options = std::make_shared<TranslateOptions>();
  return {
      .operands = {{"INPUT", "input file; standard input if - or not given", into(options->input)}},
      .options = optionsOf(*options),
      .notes = notes,
      .run = [options] {
        check(*options);
        return translateFile(*options);
      }};
}

} // namespace nls2::tool
