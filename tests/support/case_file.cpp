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

// A unit from hex digits.
template <class Unit>
std::string unit(std::istream &text) {
  std::string digits(sizeof(Unit) * 2, ' ');
  text.read(digits.data(), static_cast<std::streamsize>(digits.size()));
  if (!std::ranges::all_of(digits, [](unsigned char c) { return std::isxdigit(c); })) {
    throw std::invalid_argument("too few hex digits");
  }
  const auto value = static_cast<Unit>(std::stoul(digits, nullptr, 16));
  return {reinterpret_cast<const char *>(&value), sizeof value};
}

std::string unescaped(const std::string &escaped);

std::string repeated(std::istream &text) {
  std::size_t count = 0;
  text >> count;
  std::string once(1, static_cast<char>(text.get()));
  if (once == "(" && std::getline(text, once, ')')) {
    once =
        text.eof() ? throw std::invalid_argument("no ) ends the repeated text") : unescaped(once);
  }
  if (!text) {
    throw std::invalid_argument("\\* wants a count and what to repeat");
  }
  std::string bytes;
  for (; count > 0; --count) {
    bytes += once;
  }
  return bytes;
}

std::string escape(std::istream &text) {
  const char kind = static_cast<char>(text.get());
  constexpr std::string_view letters = "nt0\\";
  if (const std::size_t at = letters.find(kind); at != letters.npos) {
    return {"\n\t\0\\"[at]};
  }
  switch (kind) {
  case 'x':
    return unit<uint8_t>(text);
  case 'u':
    return unit<uint16_t>(text);
  case 'U':
    return unit<uint32_t>(text);
  case '*':
    return repeated(text);
  default:
    throw std::invalid_argument("no such escape");
  }
}

std::string unescaped(const std::string &escaped) {
  std::istringstream text(escaped);
  std::string bytes;
  for (char c = 0; text.get(c);) {
    bytes += c == '\\' ? escape(text) : std::string(1, c);
  }
  return bytes;
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
  char *end = nullptr;
  const long long number = std::strtoll(value.c_str(), &end, 0);
  return *end == '\0' ? number : throw error("not a number");
}

std::pair<std::string, CaseLine> CaseLine::split(const std::string &separator) const {
  const std::size_t at = value.find(separator);
  if (at == 0 || at == std::string::npos || at + separator.size() == value.size()) {
    throw error("two values expected, with \"" + separator + "\" between them");
  }
  return {value.substr(0, at), {key, value.substr(at + separator.size()), place}};
}

std::vector<Case> readCases(const std::string &path, const std::vector<std::string> &keys) {
  std::ifstream file(path);
  std::vector<Case> cases;
  int number = 0;
  for (std::string line; std::getline(file, line);) {
    const std::size_t blank = std::min(line.find(' '), line.size());
    const CaseLine read{line.substr(0, blank), line.substr(std::min(blank + 1, line.size())),
                        path + ":" + std::to_string(++number)};
    if (line.empty() || line[0] == '#') {
      continue;
    }
    if (read.value.empty() || (cases.empty() && read.key != "==")) {
      throw read.error("no value, or no case begins before");
    }
    if (read.key == "==") {
      cases.push_back({read.value, read.place, {}});
    } else if (read.key.empty() && !cases.back().lines.empty()) {
      cases.back().lines.back().value += line;
    } else if (std::ranges::find(keys, read.key) != keys.end()) {
      cases.back().lines.push_back(read);
    } else {
      throw read.error("no such key");
    }
  }
  return cases.empty() ? throw std::runtime_error(path + ": no cases") : cases;
}

std::vector<std::string> caseFiles(const std::string &folder) {
  std::vector<std::string> files;
  for (const auto &entry : std::filesystem::directory_iterator(folder)) {
    if (entry.path().extension() == ".cases") {
      files.push_back(entry.path().string());
    }
  }
  std::ranges::sort(files);
  return files.empty() ? throw std::runtime_error(folder + ": no case files") : files;
}

std::vector<std::string> split(const std::string &text, char separator) {
  std::vector<std::string> parts;
  std::istringstream stream(text);
  for (std::string part; std::getline(stream, part, separator);) {
    if (!part.empty()) {
      parts.push_back(part);
    }
  }
  return parts;
}

} // namespace support
