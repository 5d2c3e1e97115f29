// Whole traces of calls, with a fault on request, and what the calls work on.
#pragma once

#include "nls2.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace support {

// What goes wrong in a call: an ICU function (see FailingConversion) the nth time with status 7, or
// every realloc of a size.
struct Fault {
  const char *function = nullptr;
  int call = 0;
  std::size_t reallocSize = 0;
};

using Call = std::function<int32_t()>;

// Runs the call and returns the lines of `outer`, the outermost function, without its name and
// sign: "> entry", detail texts, and "= 0" for the exit. Of each function that it calls itself only
// the exit, as "ValidateLocale= 38"; what an open of a converter returns shows as "converter".
// Marks, those on converters too, stand as they are. Every line ends in a newline.
std::string tracedCall(const std::string &outer, const Fault &fault, const Call &call);

// A function's way, a step a fault: the lines up to it, the lines that follow it when it comes, and
// what the call then answers. Expects each fault's whole trace, and no converter left open; without
// a fault the trace goes on with the next step's lines. Faults of a heap that cannot refuse are
// left out.
struct Step {
  std::string lines;
  Fault fault;
  std::string failure;
  int32_t answer;
};
void expectSteps(const std::string &outer, const std::vector<Step> &steps, const Call &call);

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
