// Outlines of recorded traces.

#include "support/trace_outline.h"

#include "nls2.h"

#include <sstream>

namespace support {

namespace {

bool isWord(char c) { return std::isalnum(static_cast<unsigned char>(c)) != 0 || c == '-'; }

void replaceWord(std::string &text, const std::string &word, const std::string &with) {
  for (size_t at = text.find(word); at != std::string::npos; at = text.find(word, at + 1)) {
    const size_t end = at + word.size();
    if ((at == 0 || !isWord(text[at - 1])) && (end == text.size() || !isWord(text[end]))) {
      text.replace(at, word.size(), with);
    }
  }
}

std::string named(std::string line, const Names &names) {
  for (const auto &[pointer, name] : names) {
    if (pointer != nullptr) {
      replaceWord(line, hex(pointer), "{" + name + "}");
      replaceWord(line, exitValue(pointer), "{" + name + "}");
    }
  }
  return line;
}

class Outline {
public:
  void add(const std::string &line) {
    const size_t end = line.find_first_of(">:= ");
    const std::string function = line.substr(0, end);
    const char sign = end == std::string::npos ? ' ' : line[end];
    if (sign == '>') {
      if (open_.empty()) {
        text_ << "> " << function << '\n';
      }
      open_.push_back(function);
    } else if (sign == ' ') {
      mark(line);
    } else if (open_.empty() || open_.back() != function) {
      text_ << "!! " << line << '\n';
    } else if (sign == ':' && open_.size() == 1) {
      text_ << line.substr(end) << '\n';
    } else if (sign == '=') {
      leave(function, line.substr(end));
    }
  }
  std::string text() const { return text_.str() + (open_.empty() ? "" : "!! not left\n"); }

private:
  void mark(const std::string &line) {
    if (open_.size() > 1) {
      return;
    }
    if (line == "lock " + hex(&LocaleObjectList_Lock)) {
      text_ << "lock\n";
    } else if (line == "unlock " + hex(&LocaleObjectList_Lock)) {
      text_ << "unlock\n";
    } else {
      text_ << line << '\n';
    }
  }
  void leave(const std::string &function, const std::string &exit) {
    open_.pop_back();
    if (open_.empty()) {
      text_ << exit << '\n';
    } else if (open_.size() == 1) {
      text_ << function << ' ' << exit << '\n';
    }
  }

  std::vector<std::string> open_;
  std::ostringstream text_;
};

} // namespace

std::string filled(std::string text, const std::string &mark, const std::string &with) {
  for (size_t at = text.find(mark); at != std::string::npos; at = text.find(mark, at)) {
    text.replace(at, mark.size(), with);
    at += with.size();
  }
  return text;
}

std::string outline(const Recording &recording, const Names &names) {
  Outline outline;
  for (const std::string &line : recording.lines()) {
    outline.add(named(line, names));
  }
  return outline.text();
}

} // namespace support
