// NLS2F_Translate compared with ICU and iconv kept open, on the same fields; columns, and opening.

#include <algorithm>
#include <benchmark/benchmark.h>
#include <cstdlib>
#include <iconv.h>
#include <iostream>
#include <iterator>
#include <new>
#include <nls2_fields.h>
#include <string>
#include <unicode/ucnv.h>
#include <vector>

namespace {

std::size_t allocations = 0;

constexpr std::size_t capacity = 16384;

// A way to translate, and how each contender names its pages.
struct Way {
  const char *name;
  int32_t padding;
  const char *icuFrom; // and the library's
  const char *icuTo;
  const char *iconvFrom;
  const char *iconvTo;
  char blank;       // of the source, cut off by those that do not do it themselves
  const char *text; // 10 bytes
};

constexpr const char hello37[] = "\xC8\x85\x93\x93\x96\x6B\xD2\xD6\x93\x95";
constexpr const char mixed930[] = "\x0E\x43\x81\x43\x82\x0F\xC1\xC2\xC3\xC4";

constexpr Way ways[] = {
    // clang-format off
    {"37_to_UTF8_strip", NLS2F_STRIP, "ibm-37", "utf-8", "IBM037", "UTF-8", '\x40', hello37},
    {"UTF8_to_37", NLS2F_AS_IS, "utf-8", "ibm-37", "UTF-8", "IBM037", '\0', "Hello, \xC3\xB6!"},
    {"930_to_UTF8", NLS2F_AS_IS, "ibm-930", "utf-8", "IBM930", "UTF-8", '\0', mixed930},
    {"UTF8_to_930", NLS2F_AS_IS, "utf-8", "ibm-930", "UTF-8", "IBM930", '\0', "\xE3\x82\xA2\xE3\x82\xA4" "ABCD"},
    {"37_to_UTF16BE", NLS2F_AS_IS, "ibm-37", "utf-16be", "IBM037", "UTF-16BE", '\0', hello37},
    {"UTF16BE_to_37", NLS2F_AS_IS, "utf-16be", "ibm-37", "UTF-16BE", "IBM037", '\0', "\0H\0e\0l\0l\0o"},
    {"930_to_UTF16BE", NLS2F_AS_IS, "ibm-930", "utf-16be", "IBM930", "UTF-16BE", '\0', mixed930},
    {"UTF16BE_to_930", NLS2F_AS_IS, "utf-16be", "ibm-930", "UTF-16BE", "IBM930", '\0', "\x30\xA2\x30\xA4\0A\0B\0C"},
    // clang-format on
};

std::string fieldOf(const Way &way, std::size_t size) {
  std::string field;
  while (field.size() < size) {
    field.append(way.text, 10);
  }
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
  explicit Field(const Way &way) {
    NLS2F_OpenPageByName(way.icuFrom, &from_);
    NLS2F_OpenPageByName(way.icuTo, &to_);
    const NLS2F_Policy policy = {sizeof policy, way.padding, NLS2F_STOP, 0, 0};
    NLS2F_OpenTranslator(from_, to_, &policy, &translator_);
  }
  ~Field() {
    NLS2F_CloseTranslator(translator_);
    NLS2F_ClosePage(to_);
    NLS2F_ClosePage(from_);
  }
  Field(const Field &) = delete;
  Field &operator=(const Field &) = delete;
  std::size_t translate(const std::string &field, char *out) {
    int64_t written = 0;
    NLS2F_Translate(translator_, field.data(), std::ssize(field), out, capacity, &written, nullptr,
                    nullptr);
    return static_cast<std::size_t>(written);
  }
  int32_t translateColumn(NLS2F_Column &column) {
    return NLS2F_TranslateColumn(translator_, &column, nullptr);
  }

private:
  NLS2F_Page *from_ = nullptr;
  NLS2F_Page *to_ = nullptr;
  NLS2F_Translator *translator_ = nullptr;
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

// A million fields of 10 bytes; a turn's time is that of all.
void runColumn(benchmark::State &state) {
  constexpr int64_t rows = 1'000'000;
  Field contender(ways[0]);
  const std::string field = fieldOf(ways[0], 10);
  std::string fields;
  for (int64_t row = 0; row < rows; ++row) {
    fields += field;
  }
  std::string out(fields.size(), '\0');
  std::vector<int32_t> offsets(rows + 1);
  for (auto _ : state) {
    NLS2F_Column column = {};
    column.size = sizeof column;
    column.offsetBits = 32;
    column.fields = fields.data();
    column.length = column.stride = 10;
    column.rows = rows;
    column.out = out.data();
    column.room = std::ssize(out);
    column.offsets = offsets.data();
    if (contender.translateColumn(column) != 0) {
      state.SkipWithError("the column failed");
    }
  }
}

// Opening, and the first field.
template <class Contender>
void runOpening(benchmark::State &state) {
  const std::string field = fieldOf(ways[2], 80);
  std::string out(capacity, '\0');
  for (auto _ : state) {
    Contender contender(ways[2]);
    benchmark::DoNotOptimize(contender.translate(field, out.data()));
  }
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

// Not inlined, or GCC takes them for mismatched pairs.
[[gnu::noinline]] void *operator new(std::size_t size) {
  ++allocations;
  if (void *block = std::malloc(size)) {
    return block;
  }
  throw std::bad_alloc();
}
[[gnu::noinline]] void operator delete(void *block) noexcept { std::free(block); }
[[gnu::noinline]] void operator delete(void *block, std::size_t /*size*/) noexcept {
  std::free(block);
}

static int runAll(int argc, char **argv) {
  if (!answersAgree()) {
    return 1;
  }
  add<Field>("nls2");
  add<Icu>("ICU");
  add<Iconv>("iconv");
  benchmark::RegisterBenchmark("column/nls2/1000000", runColumn);
  benchmark::RegisterBenchmark("opening/nls2/80", runOpening<Field>);
  benchmark::RegisterBenchmark("opening/ICU/80", runOpening<Icu>);
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  return 0;
}

// NOLINTNEXTLINE(bugprone-exception-escape): an exception ends the program, which is right
int main(int argc, char **argv) { return runAll(argc, argv); }
