// Lines held in memory with their sort keys, and put in order.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>
#include <vector>

namespace nls2::tool {

class SortedLines {
public:
  // Keeps copies of both. A key has no zero byte but its last.
  void add(std::string_view line, std::string_view key);
  // Lines with equal keys stay in the order in which they were added.
  void sort();

  template <typename Visit>
  void forEach(Visit visit) const {
    for (const Entry &entry : entries_) {
      visit(std::string_view(entry.bytes + entry.keyLength, entry.lineLength));
    }
  }

private:
  // Most comparisons need the first bytes of the keys only, and those are beside each other.
  struct Entry {
    uint64_t prefix;   // of the key, in an order that compares as its bytes do
    const char *bytes; // the key, and after it the line
    uint32_t keyLength;
    uint32_t lineLength;
  };

  static bool isBefore(const Entry &a, const Entry &b);
  char *allocate(std::size_t length);

  std::vector<Entry> entries_;
  std::vector<std::unique_ptr<char[]>> blocks_;
  char *free_ = nullptr; // in the last block
  std::size_t freeLength_ = 0;
};

} // namespace nls2::tool
