// NLS2_TranslateString, all options and capacities, against the rules of its header over bare ICU.

#include "checks.h"
#include "convert/translate_oracle.h"
#include "nls2.h"

namespace {

using fuzz::check;

constexpr uint32_t paddings = NLS2_STRING_FILL | NLS2_STRING_TRAILING | NLS2_STRING_STRIP_TRAILING;

oracle::Page asOracle(const fuzz::Page &page) {
  return {page.number, page.icuName, page.terminator};
}

uint32_t options(FuzzedDataProvider &input) {
  uint32_t chosen = input.ConsumeIntegral<uint8_t>() % 16;
  chosen = (chosen & 8) | ((chosen & 1) << 8) | ((chosen & 2) << 8) | ((chosen & 4) << 12);
  // Other bits beside a padding are ignored.
  return (chosen & paddings) != 0 && input.ConsumeBool() ? chosen | 0x21 : chosen;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider input(data, size);
  const oracle::Page from = asOracle(fuzz::page(input));
  const oracle::Page to = asOracle(fuzz::page(input));
  const uint32_t chosen = options(input);
  const auto capacity = input.ConsumeIntegralInRange<int32_t>(0, 200);
  const bool terminated = input.ConsumeBool();
  std::string bytes = input.ConsumeRemainingBytesAsString();
  const int32_t length = terminated ? -1 : static_cast<int32_t>(bytes.size());
  const auto source = fuzz::exact(terminated ? std::string(bytes.c_str()) + '\0' : bytes);

  const oracle::Request request{from, to, bytes, length, capacity, chosen};
  // The second zero byte of a terminator goes past destLen.
  std::string before(static_cast<size_t>(capacity) + (to.terminator == 2 ? 1 : 0), '#');
  const fuzz::Output<char> dest(before.size());
  std::copy(before.begin(), before.end(), dest.get());
  int32_t consumed = -1;
  int32_t status = -1;
  const int32_t result = NLS2_TranslateString(to.number, dest.get(), capacity, from.number,
                                              source.get(), length, &consumed, chosen, &status);
  const oracle::Outcome expected = oracle::translate(request, before);
  if (status == 15 && expected.status == 0 && expected.result == capacity) {
    return 0; // ICU asks for room for characters left over that take no bytes
  }
  check(status == expected.status, "status");
  check(result == expected.result, "result");
  check(consumed == expected.consumed, "bytes consumed");
  for (size_t i = 0; status == 0 && i < before.size(); ++i) {
    // ICU's Latin-1 converter uses the room behind its output to try what comes next.
    check(expected.dest[i] == '#' || dest.get()[i] == expected.dest[i], "bytes");
  }
  return 0;
}
