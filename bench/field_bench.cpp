// nls2::translator compared with ICU and iconv kept open, on the same fields.

#include <algorithm>
#include <benchmark/benchmark.h>
#include <cstdlib>
#include <iconv.h>
#include <iostream>
#include <new>
#include <nls2/translator.hpp>
#include <string>
#include <unicode/ucnv.h>

namespace {

std::size_t allocations = 0;

constexpr std::size_t capacity = 16384;

// A way to translate, and how each contender names its pages.
struct Way {
  const char *name;
  int32_t from;
  int32_t to;
  nls2::padding padding;
  const char *icuFrom;
  const char *icuTo;
  const char *iconvFrom;
  const char *iconvTo;
  char blank; // of the source, cut off by those that do not do it themselves
  const char *text;
};

constexpr Way ways[] = {
    {"37_to_UTF8_strip", 37, 1208, nls2::padding::strip, "ibm-37", "utf-8", "IBM037", "UTF-8",
     '\x40', "\xC8\x85\x93\x93\x96\x6B\xD2\xD6\x93\x95"},
    {"930_to_UTF8", 930, 1208, nls2::padding::as_is, "ibm-930", "utf-8", "IBM930", "UTF-8", '\0',
     "\x0E\x43\x81\x43\x82\x0F\xC1\xC2\xC3\xC4"},
    {"UTF8_to_930", 1208, 930, nls2::padding::as_is, "utf-8", "ibm-930", "UTF-8", "IBM930", '\0',
     "\xE3\x82\xA2\xE3\x82\xA4"
     "ABCD"},
    {"UTF8_to_37", 1208, 37, nls2::padding::as_is, "utf-8", "ibm-37", "UTF-8", "IBM037", '\0',
     "Hello, \xC3\xB6!"},
};

std::string fieldOf(const Way &way, std::size_t size) {
  std::string field;
  while (field.size() < size) {
    field += way.text;
  }
  field.resize(size - size % 10);
  if (way.blank != '\0') {
    std::fill(field.end() - static_cast<std::ptrdiff_t>(size / 5), field.end(), way.blank);
  }
  return field;
}

std::size_t textLength(const Way &way, const std::string &field) {
  return way.blank == '\0' ? field.size() : field.find_last_not_of(way.blank) + 1;
}

class Field {
public:
  explicit Field(const Way &way)
      : translator_(nls2::code_page(way.from), nls2::code_page(way.to), {.padding = way.padding}) {}
  std::size_t translate(const std::string &field, char *out) {
    return translator_.translate(field, std::span(out, capacity)).written;
  }

private:
  nls2::translator translator_;
};

class Icu {
public:
  explicit Icu(const Way &way)
      : way_(way), from_(ucnv_open(way.icuFrom, &error_)), to_(ucnv_open(way.icuTo, &error_)) {}
  ~Icu() {
    ucnv_close(from_);
    ucnv_close(to_);
  }
  Icu(const Icu &) = delete;
  Icu &operator=(const Icu &) = delete;
  std::size_t translate(const std::string &field, char *out) {
    char *target = out;
    const char *source = field.data();
    ucnv_convertEx(to_, from_, &target, out + capacity, &source, source + textLength(way_, field),
                   nullptr, nullptr, nullptr, nullptr, true, true, &error_);
    return static_cast<std::size_t>(target - out);
  }

private:
  const Way &way_;
  UErrorCode error_ = U_ZERO_ERROR;
  UConverter *from_;
  UConverter *to_;
};

class Iconv {
public:
  explicit Iconv(const Way &way) : way_(way), open_(iconv_open(way.iconvTo, way.iconvFrom)) {}
  ~Iconv() { iconv_close(open_); }
  Iconv(const Iconv &) = delete;
  Iconv &operator=(const Iconv &) = delete;
  std::size_t translate(const std::string &field, char *out) {
    char *source = const_cast<char *>(field.data());
    std::size_t left = textLength(way_, field);
    std::size_t room = capacity;
    char *target = out;
    iconv(open_, nullptr, nullptr, nullptr, nullptr);
    iconv(open_, &source, &left, &target, &room);
    iconv(open_, nullptr, nullptr, &target, &room);
    return static_cast<std::size_t>(target - out);
  }

private:
  const Way &way_;
  iconv_t open_;
};

template <class Contender>
void run(benchmark::State &state, const Way &way, std::size_t size) {
  Contender contender(way);
  const std::string field = fieldOf(way, size);
  std::string out(capacity, '\0');
  contender.translate(field, out.data());
  const std::size_t before = allocations;
  for (auto _ : state) {
    benchmark::DoNotOptimize(contender.translate(field, out.data()));
    benchmark::ClobberMemory();
  }
  state.counters["allocations"] = static_cast<double>(allocations - before);
}

template <class Contender>
std::string answer(const Way &way, std::size_t size) {
  Contender contender(way);
  std::string out(capacity, '\0');
  out.resize(contender.translate(fieldOf(way, size), out.data()));
  return out;
}

// All contenders must agree before they are timed.
bool answersAgree() {
  for (const Way &way : ways) {
    for (const std::size_t size : {10U, 80U, 1000U}) {
      const std::string expected = answer<Field>(way, size);
      if (expected.empty() || answer<Icu>(way, size) != expected ||
          answer<Iconv>(way, size) != expected) {
        std::cerr << way.name << ": the answers differ at " << size << " bytes\n";
        return false;
      }
    }
  }
  return true;
}

template <class Contender>
void add(const char *contender) {
  for (const Way &way : ways) {
    for (const std::size_t size : {10U, 80U, 1000U}) {
      const std::string name = std::string(way.name) + "/" + contender + "/" + std::to_string(size);
      benchmark::RegisterBenchmark(name.c_str(), [&way, size](benchmark::State &state) {
        run<Contender>(state, way, size);
      });
    }
  }
}

} // namespace

void *operator new(std::size_t size) {
  ++allocations;
  if (void *block = std::malloc(size)) {
    return block;
  }
  throw std::bad_alloc();
}
void operator delete(void *block) noexcept { std::free(block); }
void operator delete(void *block, std::size_t /*size*/) noexcept { std::free(block); }

static int runAll(int argc, char **argv) {
  if (!answersAgree()) {
    return 1;
  }
  add<Field>("nls2");
  add<Icu>("ICU");
  add<Iconv>("iconv");
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return 0;
}

// NOLINTNEXTLINE(bugprone-exception-escape): an exception ends the program, which is right
int main(int argc, char **argv) { return runAll(argc, argv); }
