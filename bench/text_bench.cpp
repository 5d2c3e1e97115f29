// Comparison, search and UTF conversion, compared with the bare calls of ICU and the heap that they
// make.

#include "nls2.h"

#include <benchmark/benchmark.h>
#include <cstdlib>
#include <cstring>
#include <iostream>
#include <memory>
#include <string>
#include <unicode/ucnv.h>
#include <unicode/ucol.h>
#include <unicode/ustring.h>

namespace {

constexpr uint32_t deDe = 0x01140002;
constexpr uint32_t codepage = 819;
constexpr const char *localeName = "de_DE";
constexpr int32_t capacity = 1024;

NLS2_Locale *theLocale = nullptr;

std::string textOf(int64_t size, char last) {
  std::string text;
  while (static_cast<int64_t>(text.size()) < size) {
    text += "Gr\xFC\xDF"
            "e aus Wien, ";
  }
  text.resize(static_cast<std::size_t>(size));
  text.back() = last;
  return text;
}

// Two texts that differ in their last letter, and outputs.
struct Operands {
  explicit Operands(int64_t length)
      : first(textOf(length, 'a')), second(textOf(length, 'b')),
        size(static_cast<int32_t>(length)) {}

  std::string first;
  std::string second;
  int32_t size;
  char bytes[capacity] = {};
  UChar units[capacity] = {};
};

UConverter *openPage() {
  UErrorCode error = U_ZERO_ERROR;
  return ucnv_openCCSID(codepage, UCNV_IBM, &error);
}

struct Units {
  UChar *units;
  int32_t length;
};

Units toUnits(UConverter *converter, const std::string &text, bool clear) {
  UErrorCode error = U_ZERO_ERROR;
  const auto size = static_cast<int32_t>(text.size());
  const int32_t length = ucnv_toUChars(converter, nullptr, 0, text.data(), size, &error);
  const auto bytes = static_cast<std::size_t>(length) * 2 + 2;
  auto *units = static_cast<UChar *>(std::realloc(nullptr, bytes));
  if (clear) {
    std::memset(units, 0, bytes);
  }
  error = U_ZERO_ERROR;
  ucnv_toUChars(converter, units, length + 1, text.data(), size, &error);
  return {units, length};
}

int32_t strcollLibrary(Operands &with) {
  int32_t status = 0;
  const auto size = static_cast<int16_t>(with.size);
  return NLS2_Strcoll(theLocale, with.first.data(), size, with.second.data(), size, 0, &status);
}

int32_t strcollBare(Operands &with) {
  UErrorCode error = U_ZERO_ERROR;
  UConverter *converter = openPage();
  const Units first = toUnits(converter, with.first, true);
  const Units second = toUnits(converter, with.second, true);
  ucnv_close(converter);
  UCollator *collator = ucol_open(localeName, &error);
  ucol_setStrength(collator, UCOL_TERTIARY);
  const int32_t order =
      ucol_strcoll(collator, first.units, first.length, second.units, second.length);
  std::free(first.units);
  std::free(second.units);
  ucol_close(collator);
  return order;
}

int32_t findstrLibrary(Operands &with) {
  return NLS2_Findstr(theLocale, with.first.data(), with.size, with.second.data(), with.size, 0);
}

int32_t findstrBare(Operands &with) {
  UConverter *converter = openPage();
  const Units first = toUnits(converter, with.first, false);
  const Units second = toUnits(converter, with.second, false);
  const UChar *found = u_strstr(first.units, second.units);
  std::free(first.units);
  std::free(second.units);
  ucnv_close(converter);
  return found != nullptr ? 1 : 0;
}

int32_t toUtf8Library(Operands &with) {
  int32_t status = 0;
  return NLS2_toUTF8(theLocale, with.first.data(), with.size, with.bytes, capacity, &status);
}

int32_t toUtf8Bare(Operands &with) {
  UErrorCode error = U_ZERO_ERROR;
  UConverter *converter = openPage();
  const char *name = ucnv_getName(converter, &error);
  const int32_t length =
      ucnv_convert("utf-8", name, with.bytes, capacity, with.first.data(), with.size, &error);
  ucnv_close(converter);
  return length;
}

int32_t toUtf16Library(Operands &with) {
  int32_t status = 0;
  return NLS2_toUTF16(theLocale, with.first.data(), with.size, with.units, capacity, &status);
}

int32_t toUtf16Bare(Operands &with) {
  UErrorCode error = U_ZERO_ERROR;
  UConverter *converter = openPage();
  const int32_t length =
      ucnv_toUChars(converter, with.units, capacity, with.first.data(), with.size, &error);
  ucnv_close(converter);
  return length;
}

template <int32_t (*Function)(Operands &)>
void run(benchmark::State &state) {
  const auto with = std::make_unique<Operands>(state.range(0));
  for (auto _ : state) {
    benchmark::DoNotOptimize(Function(*with));
    benchmark::ClobberMemory();
  }
}

void byteLength(benchmark::State &state) {
  int32_t status = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(NLS2_ByteLength(theLocale, "\xE2\x82\xAC", &status));
  }
}

BENCHMARK(run<strcollLibrary>)->Name("Strcoll")->Arg(20)->Arg(200);
BENCHMARK(run<strcollBare>)->Name("StrcollBare")->Arg(20)->Arg(200);
BENCHMARK(run<findstrLibrary>)->Name("Findstr")->Arg(20)->Arg(200);
BENCHMARK(run<findstrBare>)->Name("FindstrBare")->Arg(20)->Arg(200);
BENCHMARK(run<toUtf8Library>)->Name("toUTF8")->Arg(20)->Arg(200);
BENCHMARK(run<toUtf8Bare>)->Name("toUTF8Bare")->Arg(20)->Arg(200);
BENCHMARK(run<toUtf16Library>)->Name("toUTF16")->Arg(20)->Arg(200);
BENCHMARK(run<toUtf16Bare>)->Name("toUTF16Bare")->Arg(20)->Arg(200);
BENCHMARK(byteLength)->Name("ByteLength");

// All contenders must agree before they are timed.
bool answersAgree() {
  using Function = int32_t (*)(Operands &);
  constexpr Function pairs[][2] = {{strcollLibrary, strcollBare},
                                   {findstrLibrary, findstrBare},
                                   {toUtf8Library, toUtf8Bare},
                                   {toUtf16Library, toUtf16Bare}};
  for (const auto &pair : pairs) {
    Operands library(200);
    Operands bare(200);
    if (pair[0](library) != pair[1](bare) ||
        std::memcmp(library.bytes, bare.bytes, sizeof bare.bytes) != 0 ||
        std::memcmp(library.units, bare.units, sizeof bare.units) != 0) {
      return false;
    }
  }
  return true;
}

} // namespace

int main(int argc, char **argv) {
  int32_t status = 0;
  theLocale = NLS2_GetLocale(deDe, codepage, 0, &status);
  if (theLocale == nullptr || !answersAgree()) {
    std::cerr << "no locale object, or the answers differ: status " << status << '\n';
    return 1;
  }
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  NLS2_ReleaseLocale(theLocale);
  return 0;
}
