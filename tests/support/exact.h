// Texts in blocks of exactly their size.
#pragma once

#include <algorithm>
#include <memory>
#include <string>

namespace support {

// The units alone, in a heap block of their own, so that a sanitizer sees a read past them.
template <class Unit>
std::unique_ptr<Unit[]> exact(const std::basic_string<Unit> &text) {
  auto block = std::make_unique<Unit[]>(text.size());
  std::copy(text.begin(), text.end(), block.get());
  return block;
}

} // namespace support
