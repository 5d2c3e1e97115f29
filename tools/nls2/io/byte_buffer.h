// A growing byte buffer that, unlike std::string, does not clear new room.
#pragma once

#include <algorithm>
#include <cstdlib>
#include <new>
#include <span>
#include <string_view>
#include <utility>

namespace nls2::tool {

class ByteBuffer {
public:
  ByteBuffer() = default;
  ~ByteBuffer() { std::free(data_); }
  ByteBuffer(const ByteBuffer &) = delete;
  ByteBuffer &operator=(const ByteBuffer &) = delete;

  // At least `length` bytes of room after the bytes. Throws std::bad_alloc.
  std::span<char> room(std::size_t length) {
    if (capacity_ - size_ < length) {
      const std::size_t capacity = std::max(size_ + length, capacity_ + capacity_ / 2);
      auto *grown = static_cast<char *>(std::realloc(data_, capacity));
      if (grown == nullptr) {
        throw std::bad_alloc();
      }
      data_ = grown;
      capacity_ = capacity;
    }
    return {data_ + size_, capacity_ - size_};
  }
  // Makes the first `length` bytes of the room part of the buffer.
  void commit(std::size_t length) { size_ += length; }
  void append(std::string_view bytes) {
    std::copy(bytes.begin(), bytes.end(), room(bytes.size()).begin());
    commit(bytes.size());
  }
  void truncate(std::size_t size) { size_ = size; }
  // Also frees the memory if it is more than `most`.
  void clear(std::size_t most) {
    size_ = 0;
    if (capacity_ > most) {
      std::free(std::exchange(data_, nullptr));
      capacity_ = 0;
    }
  }

  char *at(std::size_t place) { return data_ + place; }
  std::size_t size() const { return size_; }
  std::string_view bytes() const { return {data_, size_}; }

private:
  char *data_ = nullptr;
  std::size_t size_ = 0;
  std::size_t capacity_ = 0;
};

} // namespace nls2::tool
