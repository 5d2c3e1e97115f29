// One run of nls2 after another, as cases/*.txt have them.
//
// A case begins with "== why". Behind it stand its lines: run, in, out, has (a fragment, in place
// of out), err (a fragment; none: standard error is empty), exit, LC_ALL, file NAME BYTES (there
// before), left NAME BYTES (there after, where not as before). Lines of in, out and has add up.
// Escapes: \n \t \0 \xHH, \uHHHH and \UHHHHHHHH (units in the machine's byte order), \*COUNTc and
// \*COUNT(TEXT) (that many times).

#include "tool_runner.h"

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <gtest/gtest.h>
#include <map>
#include <sstream>

namespace tools {

namespace {

template <typename Unit>
void appendUnit(std::string &bytes, const std::string &hex) {
  const Unit unit = static_cast<Unit>(std::stoul(hex, nullptr, 16));
  bytes.append(reinterpret_cast<const char *>(&unit), sizeof unit);
}

std::string bytesOf(const std::string &escaped);

// Appends what stands there, the count before it times.
void repeat(std::istream &text, std::string &bytes) {
  std::size_t count = 0;
  text >> count;
  std::string repeated(1, static_cast<char>(text.get()));
  if (repeated == "(") {
    std::getline(text, repeated, ')');
    repeated = bytesOf(repeated);
  }
  for (; count > 0; --count) {
    bytes += repeated;
  }
}

// Appends what the escape at the stream stands for.
void unescape(std::istream &text, std::string &bytes) {
  const auto hex = [&](std::size_t digits) {
    std::string found(digits, '\0');
    text.read(found.data(), static_cast<std::streamsize>(digits));
    return found;
  };
  switch (const char kind = static_cast<char>(text.get()); kind) {
  case 'n':
    return bytes.push_back('\n');
  case 't':
    return bytes.push_back('\t');
  case '0':
    return bytes.push_back('\0');
  case 'x':
    return appendUnit<uint8_t>(bytes, hex(2));
  case 'u':
    return appendUnit<uint16_t>(bytes, hex(4));
  case 'U':
    return appendUnit<uint32_t>(bytes, hex(8));
  case '*':
    return repeat(text, bytes);
  default:
    return bytes.push_back(kind);
  }
}

std::string bytesOf(const std::string &escaped) {
  std::istringstream text(escaped);
  std::string bytes;
  for (char c = 0; text.get(c);) {
    c == '\\' ? unescape(text, bytes) : bytes.push_back(c);
  }
  return bytes;
}

struct Case {
  std::string why;
  std::string locale = "en_US.UTF-8";
  std::string line;
  std::string input;
  int exitCode = 0;
  std::string out;
  std::vector<std::string> has;
  std::string err;
  std::map<std::string, std::string> files;
  std::map<std::string, std::string> left;
};

void read(Case &c, const std::string &key, const std::string &value) {
  const std::size_t blank = std::min(value.find(' '), value.size() - 1);
  const std::string name = bytesOf(value.substr(0, blank));
  const std::string rest = value.substr(blank + 1);
  if (key == "LC_ALL") {
    c.locale = value;
  } else if (key == "run") {
    c.line = value;
  } else if (key == "in") {
    c.input += bytesOf(value);
  } else if (key == "exit") {
    c.exitCode = std::stoi(value);
  } else if (key == "out") {
    c.out += bytesOf(value);
  } else if (key == "has") {
    c.has.push_back(bytesOf(value));
  } else if (key == "err") {
    c.err = bytesOf(value);
  } else if (key == "file" || key == "left") {
    (key == "file" ? c.files : c.left)[name] = c.left[name] = bytesOf(rest);
  } else {
    ADD_FAILURE() << c.why << ": " << key;
  }
}

std::vector<Case> casesOf(const std::string &path) {
  std::vector<Case> cases;
  std::ifstream file(path);
  for (std::string line; std::getline(file, line);) {
    const std::size_t blank = line.find(' ');
    if (line.empty() || line[0] == '#') {
      continue;
    }
    if (line.starts_with("== ")) {
      cases.emplace_back().why = line.substr(3);
    } else {
      read(cases.at(cases.size() - 1), line.substr(0, blank), line.substr(blank + 1));
    }
  }
  return cases;
}

void run(const Case &c) {
  const TempDir dir;
  for (const auto &[name, bytes] : c.files) {
    writeFile(dir.path(name), bytes);
  }
  std::vector<std::string> arguments;
  for (const std::string &word : words(c.line)) {
    arguments.push_back(word == "\"\"" ? "" : bytesOf(word));
  }
  setenv("LC_ALL", c.locale.c_str(), 1);
  const Result result = runTool(arguments, c.input, dir.path("."));
  EXPECT_EQ(result.exitCode, c.exitCode) << result.err;
  if (c.has.empty()) {
    EXPECT_EQ(result.out, c.out);
  }
  for (const std::string &fragment : c.has) {
    EXPECT_NE(result.out.find(fragment), std::string::npos) << fragment << "\n" << result.out;
  }
  EXPECT_EQ(result.err.empty(), c.err.empty()) << result.err;
  EXPECT_NE(result.err.find(c.err), std::string::npos) << c.err << "\n" << result.err;
  std::map<std::string, std::string> left;
  for (const std::string &name : dir.names()) {
    left[name] = readFile(dir.path(name));
  }
  EXPECT_EQ(left, c.left);
}

class Cases : public testing::TestWithParam<const char *> {};

TEST_P(Cases, AnswerAsTheFileHasThem) {
  const std::vector<Case> cases = casesOf(std::string(TOOL_CASES "/") + GetParam() + ".txt");
  EXPECT_FALSE(cases.empty());
  for (const Case &c : cases) {
    SCOPED_TRACE(c.why + ": " + c.line);
    run(c);
  }
}

INSTANTIATE_TEST_SUITE_P(Of, Cases,
                         testing::Values("cat", "codepages", "compare", "detect", "find", "locales",
                                         "sort", "translate", "usage"),
                         [](const auto &file) { return std::string(file.param); });

} // namespace

} // namespace tools
