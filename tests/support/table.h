// Rows of pure data, which stand in a file beside the tests: columns end in tabs, lines that begin
// with # are comments.
#pragma once

#include <fstream>
#include <gtest/gtest.h>
#include <sstream>
#include <string>
#include <vector>

namespace support {

inline std::vector<std::vector<std::string>> tableRows(const char *file) {
  std::ifstream table(file);
  std::vector<std::vector<std::string>> rows;
  for (std::string line; std::getline(table, line);) {
    if (line.front() != '#') {
      std::istringstream columns(line + '\t');
      rows.emplace_back();
      for (std::string column; std::getline(columns, column, '\t');) {
        rows.back().push_back(column);
      }
    }
  }
  EXPECT_FALSE(rows.empty()) << file;
  return rows;
}

// " 0F 10".
inline std::string hexBytes(const std::string &bytes) {
  std::ostringstream text;
  text << std::hex << std::uppercase;
  for (const char byte : bytes) {
    const auto value = static_cast<unsigned char>(byte);
    text << ' ' << (value >> 4) << (value & 0xF);
  }
  return text.str();
}

} // namespace support
