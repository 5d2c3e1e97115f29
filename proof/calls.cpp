// One call of each exported function.

#include "calls.h"

#include "support/case_file.h"
#include "support/dispatch.h"

#include <nls2/translator.hpp>
#include <regex>

namespace proof {

namespace {

// A short field, one that is longer than a new translator's buffer, and the short one again.
std::string translateFields(const support::Words &words) {
  const nls2::field_policy policy{.padding = static_cast<nls2::padding>(words.number(1)),
                                  .width = 8000,
                                  .bad = static_cast<nls2::on_bad>(words.number(2))};
  std::error_code error;
  support::aroundCall(true);
  nls2::translator translator;
  if (const nls2::code_page from(words.number(0), error); !error) {
    if (const nls2::code_page to(1208, error); !error) {
      translator = nls2::translator(from, to, policy, error);
    }
  }
  support::aroundCall(false);
  const std::string text = std::string(3000, '\xC1') + std::string(100, '\x40'); // A in EBCDIC
  std::string out(8000, '\0');
  std::string answer;
  for (const std::size_t length : {std::size_t{5}, text.size(), std::size_t{5}}) {
    if (error) {
      return support::shown(error.value());
    }
    support::aroundCall(true);
    const auto result = translator.translate(std::span(text).last(length), std::span(out));
    support::aroundCall(false);
    error = result.error();
    answer += out.substr(0, result.written) + "|";
  }
  return answer;
}

} // namespace

std::string Call::make(NLS2_Locale *in) const {
  const support::Words words(text, in);
  const std::string function = text.substr(0, text.find(' '));
  const std::string answer =
      function == "translator" ? translateFields(words) : support::functions().at(function)(words);
  return support::named(answer, words.names());
}

bool Call::isFailure(const std::string &answer) const {
  std::string pattern = std::regex_replace(onFailure, std::regex("[*]"), ".*");
  pattern = std::regex_replace(pattern, std::regex("#"), "([0-9]+)");
  std::smatch match;
  if (!std::regex_match(answer, match, std::regex(pattern))) {
    return false;
  }
  const int status = match.size() > 1 ? std::stoi(match[1]) : NLS2_ERR_NO_MEMORY;
  return (status > 0 && status < U_ERROR_LIMIT) || (status >= 36 && status <= 39) ||
         status == NLS2_ERR_NO_MEMORY;
}

const std::vector<Call> &calls() {
  static const std::vector<Call> table = [] {
    std::vector<Call> rows;
    for (const support::Case &each : support::readCases(CALLS, {"fails"})) {
      for (const support::CaseLine &line : each.lines) {
        const auto [text, onFailure] = line.split(" -> ");
        rows.push_back({text, onFailure.value});
      }
    }
    return rows;
  }();
  return table;
}

} // namespace proof
