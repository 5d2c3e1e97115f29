// Whole traces of calls, and live objects.

#include "support/call_trace.h"

#include "support/heap_probe.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>
#include <unicode/uloc.h>

namespace support {

namespace {

class Shortener {
public:
  explicit Shortener(const std::string &outer) : outer_(outer) {}

  std::string line(const std::string &line) {
    const size_t end = line.find_first_of(">:=");
    if (end == std::string::npos) {
      return line + "\n";
    }
    depth_ += line[end] == '>' ? 1 : line[end] == '=' ? -1 : 0;
    if (line.compare(0, end, outer_) == 0) {
      return line.substr(end + (line[end] == ':' ? 2 : 0)) + "\n";
    }
    return line[end] == '=' && depth_ == 1 ? exit(line, end) : "";
  }

private:
  static std::string exit(const std::string &line, size_t end) {
    if (line.rfind("NLS2_MapCodepageIdToName", 0) == 0 && line.substr(end) != "= 0") {
      return "MapCodepageIdToName= converter\n";
    }
    return line.substr(line.rfind("NLS2_", 0) == 0 ? 5 : 0) + "\n";
  }

  std::string outer_;
  int depth_ = 0;
};

} // namespace

std::string tracedCall(const std::string &outer, const Fault &fault, const Call &call) {
  const FailingConversion failing(fault.function != nullptr ? fault.function : "none", fault.call,
                                  U_MEMORY_ALLOCATION_ERROR);
  const FailingReallocs refused(fault.reallocSize != 0 ? fault.reallocSize : SIZE_MAX);
  const Recording recording(traceAll);
  const ConverterMarks marks;
  call();
  Shortener shortener(outer);
  std::string all;
  for (const std::string &line : recording.lines()) {
    all += shortener.line(line);
  }
  return all;
}

void expectSteps(const std::string &outer, const std::vector<Step> &steps, const Call &call) {
  std::string way = "> entry\n";
  for (const Step &step : steps) {
    way += step.lines;
    if (step.fault.reallocSize != 0 && !heapCanRefuse) {
      continue;
    }
    const int before = openConverters();
    int32_t answer = 0;
    EXPECT_EQ(tracedCall(outer, step.fault, [&] { return answer = call(); }), way + step.failure);
    EXPECT_EQ(answer, step.answer) << way + step.failure;
    EXPECT_EQ(openConverters(), before) << way + step.failure;
  }
}

LiveLocale::LiveLocale(uint32_t codepage, const char *name) {
  UErrorCode error = U_ZERO_ERROR;
  uloc_setDefault("en_US", &error);
  int32_t status = -1;
  object_ = NLS2_GetLocale(NLS2_LanguageIDFromShortPosixName(name, &status), codepage, 0, &status);
  EXPECT_EQ(status, 0) << name;
}

LiveLocale::~LiveLocale() { EXPECT_EQ(NLS2_ReleaseLocale(object_), 0); }

} // namespace support
