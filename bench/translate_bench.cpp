// NLS2_TranslateString compared with its ICU calls and with iconv, on the same buffers.

#include "nls2.h"

#include <algorithm>
#include <benchmark/benchmark.h>
#include <cstdlib>
#include <iconv.h>
#include <iostream>
#include <string>
#include <unicode/ucnv.h>
#include <unicode/ustring.h>

namespace {

constexpr int32_t ebcdic = 37;
constexpr int32_t utf8 = 1208;
constexpr std::size_t capacity = 4096;

struct Page {
  int32_t codepage;
  const char *iconvName;
};
constexpr Page pages[] = {{ebcdic, "IBM037"}, {utf8, "UTF-8"}};

// Which way a benchmark goes, by its second argument.
struct Direction {
  Page from;
  Page to;
};
Direction directionOf(int64_t backwards) {
  return backwards != 0 ? Direction{pages[1], pages[0]} : Direction{pages[0], pages[1]};
}

UConverter *open(int32_t codepage, UErrorCode &error) {
  return codepage == utf8 ? ucnv_open("utf-8", &error) : ucnv_openCCSID(codepage, UCNV_IBM, &error);
}

int32_t library(Direction way, const std::string &source, char *dest, int32_t destLen,
                uint32_t options) {
  int32_t consumed = 0;
  int32_t status = 0;
  return NLS2_TranslateString(way.to.codepage, dest, destLen, way.from.codepage, source.data(),
                              static_cast<int32_t>(source.size()), &consumed, options, &status);
}

int32_t bareDirect(Direction way, const std::string &source, char *dest, int32_t destLen) {
  UErrorCode error = U_ZERO_ERROR;
  UConverter *from = open(way.from.codepage, error);
  UConverter *to = open(way.to.codepage, error);
  char *target = dest;
  const char *cursor = source.data();
  ucnv_convertEx(to, from, &target, dest + destLen, &cursor, cursor + source.size(), nullptr,
                 nullptr, nullptr, nullptr, true, true, &error);
  ucnv_close(from);
  ucnv_close(to);
  return static_cast<int32_t>(target - dest);
}

// The padding path's calls of ICU and the heap, with the blanks put on by hand.
int32_t bareFill(Direction way, const std::string &source, char *dest, int32_t destLen) {
  UErrorCode error = U_ZERO_ERROR;
  UConverter *from = open(way.from.codepage, error);
  UConverter *to = open(way.to.codepage, error);
  const auto size = static_cast<int32_t>(source.size());
  const int32_t units = ucnv_toUChars(from, nullptr, 0, source.data(), size, &error);
  error = U_ZERO_ERROR;
  const auto room = static_cast<std::size_t>(std::max(units, destLen)) + 1;
  auto *buffer = static_cast<UChar *>(std::calloc(room, sizeof(UChar)));
  ucnv_toUChars(from, buffer, units, source.data(), size, &error);
  int32_t text = units;
  while (text > 0 && buffer[text - 1] == ' ') {
    --text;
  }
  error = U_ZERO_ERROR;
  ucnv_fromUChars(to, nullptr, 0, buffer, text, &error);
  std::fill(buffer + text, buffer + destLen, u' ');
  error = U_ZERO_ERROR;
  ucnv_fromUChars(to, dest, destLen, buffer, destLen, &error);
  std::free(buffer);
  ucnv_close(from);
  ucnv_close(to);
  return destLen;
}

int32_t iconvDirect(Direction way, const std::string &source, char *dest, int32_t destLen) {
  iconv_t converter = iconv_open(way.to.iconvName, way.from.iconvName);
  char *cursor = const_cast<char *>(source.data());
  std::size_t left = source.size();
  char *target = dest;
  auto room = static_cast<std::size_t>(destLen);
  iconv(converter, &cursor, &left, &target, &room);
  iconv_close(converter);
  return static_cast<int32_t>(target - dest);
}

// A source of `size` bytes in the direction's page, a fifth of it trailing blanks.
std::string sourceOf(Direction way, int64_t size) {
  std::string text;
  while (text.size() < static_cast<std::size_t>(size) * 4 / 5) {
    text += "Stock 4711 ";
  }
  text.resize(static_cast<std::size_t>(size) * 4 / 5, 'x');
  text.resize(static_cast<std::size_t>(size), ' ');
  if (way.from.codepage == utf8) {
    return text;
  }
  char page[capacity];
  const int32_t length = bareDirect(directionOf(1), text, page, sizeof page);
  return {page, static_cast<std::size_t>(length)};
}

template <class Translate>
void run(benchmark::State &state, Translate translate) {
  const Direction way = directionOf(state.range(1));
  const std::string source = sourceOf(way, state.range(0));
  char dest[capacity];
  for (auto _ : state) {
    benchmark::DoNotOptimize(translate(way, source, dest, state.range(0)));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * state.range(0));
}

void directLibrary(benchmark::State &state) {
  run(state, [](Direction way, const std::string &source, char *dest, int64_t /*size*/) {
    return library(way, source, dest, capacity, 0);
  });
}
void directBareIcu(benchmark::State &state) {
  run(state, [](Direction way, const std::string &source, char *dest, int64_t /*size*/) {
    return bareDirect(way, source, dest, capacity);
  });
}
void directIconv(benchmark::State &state) {
  run(state, [](Direction way, const std::string &source, char *dest, int64_t /*size*/) {
    return iconvDirect(way, source, dest, capacity);
  });
}
void fillLibrary(benchmark::State &state) {
  run(state, [](Direction way, const std::string &source, char *dest, int64_t size) {
    return library(way, source, dest, static_cast<int32_t>(size), NLS2_STRING_FILL);
  });
}
void fillBareIcu(benchmark::State &state) {
  run(state, [](Direction way, const std::string &source, char *dest, int64_t size) {
    return bareFill(way, source, dest, static_cast<int32_t>(size));
  });
}
// A function that does nothing but its frame.
void frameOff(benchmark::State &state) {
  for (auto _ : state) {
    benchmark::DoNotOptimize(NLS2_GetLocaleMapEntry(localeMap[0].languageId));
  }
}
// The same without one: a call through the same table.
void noFrame(benchmark::State &state) {
  for (auto _ : state) {
    benchmark::DoNotOptimize(NLS2_BuildStamp());
  }
}

void sizesAndWays(benchmark::internal::Benchmark *bench) {
  bench->ArgNames({"bytes", "from_utf8"})->ArgsProduct({{10, 80, 1000}, {0, 1}});
}
BENCHMARK(directLibrary)->Apply(sizesAndWays);
BENCHMARK(directBareIcu)->Apply(sizesAndWays);
BENCHMARK(directIconv)->Apply(sizesAndWays);
BENCHMARK(fillLibrary)->Apply(sizesAndWays);
BENCHMARK(fillBareIcu)->Apply(sizesAndWays);
BENCHMARK(frameOff);
BENCHMARK(noFrame);

// All contenders must agree before they are timed.
bool answersAgree() {
  for (const int64_t backwards : {0, 1}) {
    const Direction way = directionOf(backwards);
    for (const int32_t size : {10, 80, 1000}) {
      const std::string source = sourceOf(way, size);
      char dest[5][capacity] = {};
      const std::size_t lengths[] = {
          static_cast<std::size_t>(library(way, source, dest[0], capacity, 0)),
          static_cast<std::size_t>(bareDirect(way, source, dest[1], capacity)),
          static_cast<std::size_t>(iconvDirect(way, source, dest[2], capacity)),
          static_cast<std::size_t>(library(way, source, dest[3], size, NLS2_STRING_FILL)),
          static_cast<std::size_t>(bareFill(way, source, dest[4], size))};
      for (int i = 1; i < 5; ++i) {
        if (std::string(dest[i], lengths[i]) != std::string(dest[0], lengths[0])) {
          std::cerr << "answer " << i << " differs: " << size << " bytes\n";
          return false;
        }
      }
    }
  }
  return true;
}

} // namespace

int main(int argc, char **argv) {
  if (!answersAgree()) {
    return 1;
  }
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return 0;
}
