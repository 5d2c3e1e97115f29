// Output of many records in one block.

#include "convert/output_buffer.h"

#include <algorithm>
#include <cstring>

namespace nls2::tool {

char *OutputBuffer::room(std::size_t length) {
  const std::size_t needed = size_ + length + 1; // one more byte, so that commit() has one to reset
  if (needed > capacity_) {
    const std::size_t capacity = std::max(needed, capacity_ + capacity_ / 2);
    auto grown = std::make_unique_for_overwrite<char[]>(capacity);
    std::copy_n(data_.get(), size_, grown.get());
    std::memset(grown.get() + size_, sentinel, capacity - size_);
    data_ = std::move(grown);
    capacity_ = capacity;
  }
  return data_.get() + size_;
}

std::size_t OutputBuffer::textLength(std::size_t length) const {
  const char *start = data_.get() + size_;
  const void *zero = memrchr(start, 0, length);
  return zero != nullptr ? static_cast<std::size_t>(static_cast<const char *>(zero) - start)
                         : length;
}

void OutputBuffer::commit(std::size_t length) {
  size_ += length;
  data_[size_] = sentinel;
}

void OutputBuffer::append(std::string_view bytes) {
  std::copy(bytes.begin(), bytes.end(), room(bytes.size()));
  size_ += bytes.size();
}

void OutputBuffer::scrub(std::size_t length) {
  std::memset(data_.get() + size_, sentinel, std::min(length, capacity_ - size_));
}

void OutputBuffer::clear() {
  if (size_ > 0) {
    std::memset(data_.get(), sentinel, size_);
  }
  size_ = 0;
}

} // namespace nls2::tool
