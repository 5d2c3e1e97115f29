// Shared by the properties: choices from an input's bytes, texts, outputs of an exact size, and a check
// that ends the run.
#pragma once

#include "support/exact.h"
#include "support/pages.h"

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <iterator>
#include <memory>
#include <sanitizer/asan_interface.h>
#include <string>

// The property. It aborts if it does not hold.
extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size);

namespace property {

using support::exact;
using support::Page;

// Makes choices from the bytes of an input. After the last byte every choice is the first one.
class Input {
public:
  Input(const uint8_t *data, size_t size) : at_(data), end_(data + size) {}

  size_t below(size_t bound) {
    size_t value = 0;
    for (size_t most = bound - 1; most > 0 && at_ < end_; most >>= 8) {
      value = value << 8 | *at_++;
    }
    return value % bound;
  }
  bool flag() { return below(2) != 0; }
  template <class Choices>
  auto oneOf(const Choices &choices) {
    return choices[below(std::size(choices))];
  }
  Page page() { return oneOf(support::pages); }

  std::string bytes(size_t most) {
    const uint8_t *begin = at_;
    at_ += std::min(most, static_cast<size_t>(end_ - at_));
    return {begin, at_};
  }

  // The rest of the input, or words of several scripts in a page with blanks and nulls at the end.
  std::string text(const Page &page) {
    if (below(4) == 0) {
      return bytes(SIZE_MAX);
    }
    constexpr const char16_t *words[] = {u"A", u"Zed", u"Gr\u00FC\u00DFe", u"\u65E5\u672C",
                                         u"1", u" ",   u"\u0416",          u"\U0001F600",
                                         u",", u"\"",  u"\u0905",          u"\n"};
    constexpr const char16_t *ends[] = {u" ", u"\t", u"\u3000", u"\u00A0", u"  "};
    std::u16string units;
    for (size_t count = below(8); count > 0; --count) {
      units += oneOf(words);
    }
    for (size_t count = below(5); count > 0; --count) {
      units += below(8) == 0 ? std::u16string(1, u'\0') : oneOf(ends);
    }
    return support::encode(page, units);
  }

private:
  const uint8_t *at_;
  const uint8_t *end_;
};

// The text up to and including its first zero byte.
inline std::string terminated(const std::string &text) {
  return text.substr(0, text.find('\0')) + '\0';
}

inline void check(bool holds, const char *what) {
  if (!holds) {
    std::fprintf(stderr, "property: does not hold: %s\n", what);
    std::abort();
  }
}

// An output of exactly `size` units. A sanitizer reports an access past it by the library at once;
// ICU is not instrumented, so its writes there show at the end.
template <class Unit>
class Output {
public:
  explicit Output(size_t size) : size_(size), units_(std::make_unique<Unit[]>(size + kept)) {
    std::fill_n(get() + size_, kept, mark);
    ASAN_POISON_MEMORY_REGION(get() + size_, kept * sizeof(Unit));
  }
  ~Output() {
    ASAN_UNPOISON_MEMORY_REGION(get() + size_, kept * sizeof(Unit));
    check(std::count(get() + size_, get() + size_ + kept, mark) == kept, "no more is written");
  }
  Output(const Output &) = delete;
  Output &operator=(const Output &) = delete;
  Unit *get() const { return units_.get(); }

private:
  static constexpr ptrdiff_t kept = 16;
  static constexpr Unit mark = 0x5A;
  size_t size_;
  std::unique_ptr<Unit[]> units_;
};

} // namespace property
