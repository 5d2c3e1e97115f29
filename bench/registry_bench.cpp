// The costs of the locale registry, compared with a plain list of the same objects.

#include "nls2.h"

#include <benchmark/benchmark.h>
#include <cstdlib>
#include <iostream>
#include <vector>

namespace {

constexpr uint32_t enUs = 0x03480001;

NLS2_Locale *make() {
  int32_t status = 0;
  return NLS2_GetLocale(enUs, 819, 0, &status);
}

// `count` live objects, and the same number of objects on a list that nobody guards.
class Objects {
public:
  explicit Objects(int64_t count) {
    for (int64_t i = 0; i < count; ++i) {
      live_.push_back(make());
      auto *plain = static_cast<NLS2_Locale *>(std::calloc(1, sizeof(NLS2_Locale)));
      (plain_.empty() ? plainHead_ : plain_.back()->pNext) = plain;
      plain_.push_back(plain);
    }
  }
  ~Objects() {
    for (NLS2_Locale *object : live_) {
      NLS2_ReleaseLocale(object);
    }
    for (NLS2_Locale *object : plain_) {
      std::free(object);
    }
  }
  Objects(const Objects &) = delete;
  Objects &operator=(const Objects &) = delete;

  NLS2_Locale *at(std::size_t i) const { return live_[i]; }
  NLS2_Locale *last() const { return live_.back(); }
  NLS2_Locale *lastPlain() const { return plain_.back(); }
  NLS2_Locale *plainHead() const { return plainHead_; }

private:
  std::vector<NLS2_Locale *> live_;
  std::vector<NLS2_Locale *> plain_;
  NLS2_Locale *plainHead_ = nullptr;
};

[[gnu::noinline]] int32_t plainWalk(NLS2_Locale *const *head, const NLS2_Locale *object) {
  const NLS2_Locale *node = *head;
  while (node != nullptr && node != object) {
    node = node->pNext;
  }
  return node != nullptr ? 0 : NLS2_ERR_INVALID_LOCALE;
}

void validate(benchmark::State &state) {
  const Objects objects(state.range(0));
  for (auto _ : state) {
    benchmark::DoNotOptimize(NLS2_ValidateLocale(objects.last()));
  }
}

void validatePlain(benchmark::State &state) {
  const Objects objects(state.range(0));
  NLS2_Locale *head = objects.plainHead();
  for (auto _ : state) {
    benchmark::DoNotOptimize(plainWalk(&head, objects.lastPlain()));
    benchmark::ClobberMemory();
  }
}

// Eight objects in turn.
void validateInTurn(benchmark::State &state) {
  const Objects objects(8);
  std::size_t i = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(NLS2_ValidateLocale(objects.at(i++ % 8)));
  }
}

// One validation after each release of another object; subtract makeAndRelease.
void validateAfterRelease(benchmark::State &state) {
  const Objects objects(state.range(0));
  for (auto _ : state) {
    NLS2_ReleaseLocale(make());
    benchmark::DoNotOptimize(NLS2_ValidateLocale(objects.at(0)));
  }
}

void makeAndRelease(benchmark::State &state) {
  const Objects objects(state.range(0));
  for (auto _ : state) {
    benchmark::DoNotOptimize(NLS2_ReleaseLocale(make()));
  }
}

// Each thread validates an object of its own.
void validateOwn(benchmark::State &state) {
  NLS2_Locale *own = make();
  for (auto _ : state) {
    benchmark::DoNotOptimize(NLS2_ValidateLocale(own));
  }
  state.SetItemsProcessed(state.iterations());
  NLS2_ReleaseLocale(own);
}

BENCHMARK(validate)->Arg(1)->Arg(100)->Arg(10000);
BENCHMARK(validatePlain)->Arg(1)->Arg(100)->Arg(10000);
BENCHMARK(validateInTurn);
BENCHMARK(validateAfterRelease)->Arg(1)->Arg(100)->Arg(10000);
BENCHMARK(makeAndRelease)->Arg(1)->Arg(100)->Arg(10000);
BENCHMARK(validateOwn)->Threads(1)->Threads(2)->UseRealTime();

} // namespace

int main(int argc, char **argv) {
  if (NLS2_ReleaseLocale(make()) != 0) {
    std::cerr << "no locale object can be made from this process's default locale\n";
    return 1;
  }
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return 0;
}
