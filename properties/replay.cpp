// Runs a property on random inputs from fixed seeds: replay [COUNT [FIRST]]

#include "property.h"

#include <csignal>
#include <random>
#include <vector>

namespace {

unsigned long number = 0;

void report() {
  std::fprintf(stderr, "input %lu; again with the arguments 1 %lu\n", number, number);
}

} // namespace

int main(int argc, char **argv) {
  const unsigned long count = argc > 1 ? std::strtoul(argv[1], nullptr, 10) : 5000;
  const unsigned long first = argc > 2 ? std::strtoul(argv[2], nullptr, 10) : 0;
  std::signal(SIGABRT, [](int) { report(); });
#if defined(__SANITIZE_ADDRESS__)
  __sanitizer_set_death_callback(report);
#endif
  for (number = first; number < first + count; ++number) {
    std::mt19937 random(static_cast<std::mt19937::result_type>(number));
    std::vector<uint8_t> input(random() % 120);
    std::generate(input.begin(), input.end(), [&] { return static_cast<uint8_t>(random()); });
    LLVMFuzzerTestOneInput(input.data(), input.size());
  }
}
