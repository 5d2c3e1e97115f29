// Output of many records in one block, in which the length of a record can be found afterwards.
#pragma once

#include <cstddef>
#include <memory>
#include <string_view>

namespace nls2::tool {

// Every byte behind the output is a sentinel, never zero. The library's stripped and trailing
// fields do not say how many bytes they take, but ICU stores one zero byte behind them where there
// is room: the last zero byte in the room is the end of the field, whatever the code page.
class OutputBuffer {
public:
  static constexpr char sentinel = '\xFF';

  // At least `length` bytes behind the output, to write in; sentinels unless scrub() is owed.
  char *room(std::size_t length);
  // The end of a text written into the first `length` bytes of the room.
  std::size_t textLength(std::size_t length) const;
  // Makes the first `length` bytes of the room output.
  void commit(std::size_t length);
  void append(std::string_view bytes);
  // Restores `length` sentinels after an attempt that was given up.
  void scrub(std::size_t length);
  void clear();

  std::string_view bytes() const { return {data_.get(), size_}; }

private:
  std::unique_ptr<char[]> data_;
  std::size_t size_ = 0;
  std::size_t capacity_ = 0;
};

} // namespace nls2::tool
