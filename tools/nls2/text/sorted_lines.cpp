// Lines held in memory with their sort keys, and put in order.

#include "text/sorted_lines.h"

#include <algorithm>
#include <cstring>
#include <endian.h>

namespace nls2::tool {

namespace {

constexpr std::size_t blockLength = std::size_t{1} << 20;

uint64_t prefixOf(std::string_view key) {
  uint64_t prefix = 0;
  std::memcpy(&prefix, key.data(), std::min(key.size(), sizeof prefix));
  return be64toh(prefix);
}

} // namespace

// A text longer than a quarter of a block gets one to itself, so that little is left unused.
char *SortedLines::allocate(std::size_t length) {
  if (length > blockLength / 4) {
    blocks_.push_back(std::make_unique_for_overwrite<char[]>(length));
    return blocks_.back().get();
  }
  if (length > freeLength_) {
    blocks_.push_back(std::make_unique_for_overwrite<char[]>(blockLength));
    free_ = blocks_.back().get();
    freeLength_ = blockLength;
  }
  char *const allocated = free_;
  free_ += length;
  freeLength_ -= length;
  return allocated;
}

void SortedLines::add(std::string_view line, std::string_view key) {
  char *const bytes = allocate(key.size() + line.size());
  std::copy(key.begin(), key.end(), bytes);
  std::copy(line.begin(), line.end(), bytes + key.size());
  entries_.push_back({prefixOf(key), bytes, static_cast<uint32_t>(key.size()),
                      static_cast<uint32_t>(line.size())});
}

bool SortedLines::isBefore(const Entry &a, const Entry &b) {
  if (a.prefix != b.prefix) {
    return a.prefix < b.prefix;
  }
  return std::string_view(a.bytes, a.keyLength) < std::string_view(b.bytes, b.keyLength);
}

void SortedLines::sort() { std::stable_sort(entries_.begin(), entries_.end(), isBefore); }

} // namespace nls2::tool
