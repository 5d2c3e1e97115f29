// Test cases in text files.
//
//   # a comment
//   == why this case exists
//   key value
//    that goes on here
//
// A key may occur several times. A line that begins with a blank continues the one before. Anything
// else is an error; the message names the file and the line.
#pragma once

#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace support {

struct CaseLine {
  std::string key, value, place; // the place is "file:line"

  std::runtime_error error(const std::string &what) const;
  // The value with its escapes decoded: \n \t \0 \\ \xHH, \uHHHH and \UHHHHHHHH (a unit in the
  // machine's byte order), \*COUNTc and \*COUNT(TEXT) (that many times).
  std::string bytes() const;
  long long number() const;
  // The value's two parts before and after the first separator.
  std::pair<std::string, CaseLine> split(const std::string &separator) const;
  std::pair<std::string, CaseLine> firstWord() const { return split(" "); }
};

struct Case {
  std::string why, place;
  std::vector<CaseLine> lines;
};

// The cases of a file, at least one. Only these keys may occur.
std::vector<Case> readCases(const std::string &path, const std::vector<std::string> &keys);

// All *.cases files of a folder, at least one, sorted by name.
std::vector<std::string> caseFiles(const std::string &folder);

// The parts between the separators, without empty ones.
std::vector<std::string> split(const std::string &text, char separator);

} // namespace support
