// What the fuzz targets share: code pages to choose from, and a check that ends the run.
#pragma once

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <fuzzer/FuzzedDataProvider.h>
#include <memory>
#include <sanitizer/asan_interface.h>
#include <string>

namespace fuzz {

// A code page's number and ICU's name of its converter.
struct Page {
  int32_t number;
  const char *icuName;
  int32_t terminator; // zero bytes that end a string, as the library's table has it
};

// One of each kind that ICU has: single-byte, mixed, stateful, Unicode with and without a
// signature.
constexpr Page pages[] = {
    {37, "ibm-37", 1},       {273, "ibm-273", 1},    {819, "ibm-819", 1},
    {874, "windows-874", 1}, {930, "ibm-930", 1},    {932, "shift-jis", 1},
    {939, "ibm-939", 1},     {943, "ibm-943", 1},    {949, "windows-949", 1},
    {950, "windows-950", 1}, {954, "ibm-954", 1},    {1047, "ibm-1047", 1},
    {1141, "ibm-1141", 1},   {1200, "utf-16be", 2},  {1208, "utf-8", 1},
    {1388, "ibm-1388", 1},   {57352, "utf-8", 1},    {57358, "utf-16be", 2},
    {57359, "utf-16le", 2},  {57360, "utf-32be", 1}, {57361, "utf-32le", 1},
    {57362, "hz", 1},        {57363, "scsu", 1},     {57365, "iscii,version=0", 1},
    {57366, "utf-7", 1},     {57367, "bocu1", 1},    {57368, "utf-16", 2},
    {57369, "utf-32", 1},    {57370, "cesu-8", 1},   {57371, "gb18030", 1},
    {57372, "ucs-2", 1},
};

inline const Page &page(FuzzedDataProvider &input) {
  return pages[input.ConsumeIntegralInRange<size_t>(0, std::size(pages) - 1)];
}

inline void check(bool holds, const char *what) {
  if (!holds) {
    std::fprintf(stderr, "fuzz: does not hold: %s\n", what);
    std::abort();
  }
}

// The bytes in a heap block of exactly their size, where a read past them is seen.
template <class Unit>
std::unique_ptr<Unit[]> exact(const std::basic_string<Unit> &text) {
  auto block = std::make_unique<Unit[]>(text.size());
  std::copy(text.begin(), text.end(), block.get());
  return block;
}

// An output of exactly `size` units. The library's accesses past it are seen at once; ICU is not
// instrumented, so what it writes there is seen at the end.
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

} // namespace fuzz
