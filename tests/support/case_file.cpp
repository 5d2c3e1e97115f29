// Reads test cases from text files.

#include "support/case_file.h"

#include <algorithm>
#include <cctype>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <sstream>

namespace support {

namespace {

[[noreturn]] void fail(const std::string &place, const std::string &what) {
  throw std::runtime_error(place + ": " + what);
}

template <class Unit>
void appendUnit(std::string &bytes, std::istream &text) {
  std::string digits(sizeof(Unit) * 2, ' ');
  text.read(digits.data(), static_cast<std::streamsize>(digits.size()));
  if (!std::all_of(digits.begin(), digits.end(),
                   [](unsigned char c) { return std::isxdigit(c); })) {
    throw std::invalid_argument("too few hex digits");
  }
  const auto unit = static_cast<Unit>(std::stoul(digits, nullptr, 16));
  bytes.append(reinterpret_cast<const char *>(&unit), sizeof unit);
}

std::string unescaped(const std::string &escaped);

void appendRepeated(std::string &bytes, std::istream &text) {
  std::size_t count = 0;
  text >> count;
  std::string repeated(1, static_cast<char>(text.get()));
  if (repeated == "(") {
    std::getline(text, repeated, ')');
    if (text.eof()) {
      throw std::invalid_argument("no ) ends the repeated text");
    }
    repeated = unescaped(repeated);
  }
  if (!text) {
    throw std::invalid_argument("\\* wants a count and what to repeat");
  }
  for (; count > 0; --count) {
    bytes += repeated;
  }
}

void appendEscaped(std::string &bytes, std::istream &text) {
  switch (text.get()) {
  case 'n':
    return bytes.push_back('\n');
  case 't':
    return bytes.push_back('\t');
  case '0':
    return bytes.push_back('\0');
  case '\\':
    return bytes.push_back('\\');
  case 'x':
    return appendUnit<uint8_t>(bytes, text);
  case 'u':
    return appendUnit<uint16_t>(bytes, text);
  case 'U':
    return appendUnit<uint32_t>(bytes, text);
  case '*':
    return appendRepeated(bytes, text);
  default:
    throw std::invalid_argument("no such escape");
  }
}

std::string unescaped(const std::string &escaped) {
  std::istringstream text(escaped);
  std::string bytes;
  for (char c = 0; text.get(c);) {
    c == '\\' ? appendEscaped(bytes, text) : bytes.push_back(c);
  }
  return bytes;
}

std::string lineOf(const std::string &text, std::size_t number) {
  std::istringstream lines(text);
  std::string line;
  for (; number > 0; --number) {
    line = "(end)";
    std::getline(lines, line);
  }
  return line;
}

} // namespace

std::runtime_error CaseLine::error(const std::string &what) const {
  return std::runtime_error(place + ": " + what + ": " + key + " " + value);
}

std::string CaseLine::bytes() const {
  try {
    return unescaped(value);
  } catch (const std::invalid_argument &wrong) {
    throw error(wrong.what());
  }
}

long long CaseLine::number() const {
  std::size_t end = 0;
  try {
    const long long number = std::stoll(value, &end, value.find("0x") == 0 ? 16 : 10);
    if (end == value.size()) {
      return number;
    }
  } catch (const std::logic_error &) { // reported below
  }
  throw error("not a number");
}

std::pair<std::string, CaseLine> CaseLine::firstWord() const {
  const std::size_t blank = value.find(' ');
  if (blank == 0 || blank == std::string::npos || blank + 1 == value.size()) {
    throw error("two values expected");
  }
  return {value.substr(0, blank), {key, value.substr(blank + 1), place}};
}

std::vector<Case> readCases(const std::string &path, const std::vector<std::string> &keys) {
  std::ifstream file(path);
  std::vector<Case> cases;
  bool inside = false;
  int number = 0;
  for (std::string line; std::getline(file, line);) {
    const std::string place = path + ":" + std::to_string(++number);
    const std::size_t blank = line.find(' ');
    const std::string key = line.substr(0, blank);
    const std::string value = blank == std::string::npos ? "" : line.substr(blank + 1);
    if (line.empty()) {
      inside = false;
    } else if (value.empty() && key[0] != '#') {
      fail(place, "no value: " + line);
    } else if (key == "==") {
      inside = true;
      cases.push_back({value, place, {}});
    } else if (key[0] != '#') {
      if (!inside) {
        fail(place, "no case begins before: " + line);
      }
      if (std::find(keys.begin(), keys.end(), key) == keys.end()) {
        fail(place, "no such key: " + line);
      }
      cases.back().lines.push_back({key, value, place});
    }
  }
  if (cases.empty()) {
    fail(path, "no cases");
  }
  return cases;
}

std::vector<std::string> caseFiles(const std::string &folder) {
  std::vector<std::string> files;
  for (const auto &entry : std::filesystem::directory_iterator(folder)) {
    if (entry.path().extension() == ".cases") {
      files.push_back(entry.path().string());
    }
  }
  std::sort(files.begin(), files.end());
  if (files.empty()) {
    fail(folder, "no case files");
  }
  return files;
}

std::string difference(const std::string &expected, const std::string &actual,
                       const std::string &folder, const std::string &name) {
  if (actual == expected) {
    return "";
  }
  std::string file = name;
  std::replace_if(
      file.begin(), file.end(), [](unsigned char c) { return std::isalnum(c) == 0; }, '_');
  const std::string path = folder + "/" + file + ".actual";
  std::ofstream(path, std::ios::binary) << actual;
  const auto differs =
      std::mismatch(expected.begin(), expected.end(), actual.begin(), actual.end()).first;
  const auto line = static_cast<std::size_t>(std::count(expected.begin(), differs, '\n')) + 1;
  return name + ": line " + std::to_string(line) + " is\n  " + lineOf(actual, line) +
         "\nbut expected is\n  " + lineOf(expected, line) + "\nThe whole text: " + path;
}

} // namespace support
