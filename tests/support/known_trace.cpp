// Whole traces against known ones.

#include "support/known_trace.h"

#include <cctype>
#include <cstdlib>
#include <fstream>
#include <gtest/gtest.h>
#include <set>

namespace support {

namespace {

bool isWord(char c) { return std::isalnum(static_cast<unsigned char>(c)) != 0 || c == '-'; }

std::string replaceWord(std::string text, const std::string &word, const std::string &with) {
  for (size_t at = text.find(word); at != std::string::npos; at = text.find(word, at + 1)) {
    const size_t end = at + word.size();
    // Under a sanitizer the low half of an address can be as small as a byte of a text.
    const size_t line = text.rfind('\n', at) + 1;
    if (text.compare(line, 5, "text ") == 0) {
      continue;
    }
    if ((at == 0 || !isWord(text[at - 1])) && (end == text.size() || !isWord(text[end]))) {
      text.replace(at, word.size(), with);
    }
  }
  return text;
}

std::string named(std::string text, uint32_t pointer, const std::string &name) {
  char digits[9];
  std::snprintf(digits, sizeof digits, "%X", pointer);
  text = replaceWord(text, digits, "{" + name + "}");
  return replaceWord(text, std::to_string(static_cast<int32_t>(pointer)), "{" + name + "}");
}

std::string textOf(const Recording &recording, const Names &names) {
  const std::string opened = "NLS2_MapCodepageIdToName= ";
  std::string text;
  std::set<uint32_t> converters;
  for (const std::string &line : recording.lines()) {
    text += line + "\n";
    if (line.rfind(opened, 0) == 0 && line != opened + "0") {
      const long value = std::strtol(line.c_str() + opened.size(), nullptr, 10);
      converters.insert(static_cast<uint32_t>(value));
    }
  }
  for (const uint32_t converter : converters) {
    text = named(text, converter, "converter");
  }
  for (const auto &[pointer, name] : names) {
    text = pointer == nullptr ? text : named(text, low32(pointer), name);
  }
  return text;
}

std::string known(const std::string &section) {
  std::ifstream file(KNOWN_TRACES);
  std::string text;
  bool inside = false;
  for (std::string line; std::getline(file, line);) {
    if (line.rfind("== ", 0) == 0) {
      inside = line.substr(3) == section;
    } else if (inside && !line.empty()) {
      text += line + "\n";
    }
  }
  return text;
}

} // namespace

void expectKnownTrace(const std::string &section, const Recording &recording, const Names &names) {
  EXPECT_EQ(textOf(recording, names), known(section)) << "section " << section;
}

} // namespace support
