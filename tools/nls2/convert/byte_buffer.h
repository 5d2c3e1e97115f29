// A block of bytes that grows, and whose room is not cleared first as a std::string's is.
#pragma once

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <new>
#include <span>
#include <string_view>

namespace nls2::tool {

class ByteBuffer {
public:
  // Room behind the bytes, `length` of it at least. Throws std::bad_alloc.
  std::span<char> room(std::size_t length) {
    if (capacity_ - size_ < length) {
      const std::size_t capacity = std::max(size_ + length, capacity_ + capacity_ / 2);
      auto *grown = static_cast<char *>(std::realloc(data_.get(), capacity));
      if (grown == nullptr) {
        throw std::bad_alloc();
      }
      static_cast<void>(data_.release());
      data_.reset(grown);
      capacity_ = capacity;
    }
    return {data_.get() + size_, capacity_ - size_};
  }
  // The first `length` bytes of the room become bytes of the buffer.
  void commit(std::size_t length) { size_ += length; }
  void append(std::string_view bytes) {
    if (!bytes.empty()) {
      std::memcpy(room(bytes.size()).data(), bytes.data(), bytes.size());
      commit(bytes.size());
    }
  }
  void truncate(std::size_t size) { size_ = size; }
  // Gives the memory back as well when it is more than `most`.
  void clear(std::size_t most) {
    size_ = 0;
    if (capacity_ > most) {
      data_.reset();
      capacity_ = 0;
    }
  }

  std::size_t size() const { return size_; }
  std::string_view bytes() const { return {data_.get(), size_}; }

private:
  struct Free {
    void operator()(char *block) const noexcept { std::free(block); }
  };

  std::unique_ptr<char, Free> data_;
  std::size_t size_ = 0;
  std::size_t capacity_ = 0;
};

} // namespace nls2::tool
