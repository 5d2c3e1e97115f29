// What calls work on: live locale objects, and texts that a sanitizer watches.
#pragma once

#include "nls2.h"

#include <algorithm>
#include <memory>
#include <string>

namespace support {

// A live object of the test's own, whatever the process's default locale is: a code page and a
// short POSIX name of localeMap.
class LiveLocale {
public:
  explicit LiveLocale(uint32_t codepage, const char *name = "en_US");
  ~LiveLocale();
  LiveLocale(const LiveLocale &) = delete;
  LiveLocale &operator=(const LiveLocale &) = delete;

  const NLS2_Locale *get() const { return object_; }

private:
  NLS2_Locale *object_;
};

// The characters alone, in a block of their own, where a sanitizer sees a read past them.
template <class Unit>
std::unique_ptr<Unit[]> exact(const std::basic_string<Unit> &text) {
  auto block = std::make_unique<Unit[]>(text.size());
  std::copy(text.begin(), text.end(), block.get());
  return block;
}

} // namespace support
