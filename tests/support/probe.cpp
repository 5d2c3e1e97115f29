// The interposers' decisions in the tests.

#include "support/probe.h"

#include <atomic>
#include <cstring>
#include <unicode/ucnv.h>
#include <unicode/uloc.h>
#include <utility>

namespace support {

World world;

namespace {

std::vector<const void *> handles;
std::atomic<long> requests{0};

const char *textOrNull(const std::string &text) { return text == "null" ? nullptr : text.c_str(); }

bool isNow(Fault &fault, const interpose::Call &call, bool isHeaps) {
  if (!isHeaps) {
    return interpose::isLibrarys(call.caller) && --fault.nth == 0;
  }
  return call.size == static_cast<std::size_t>(fault.nth);
}

} // namespace

std::vector<const void *> openedHandles() { return std::exchange(handles, {}); }

long heapRequests() { return requests; }

} // namespace support

bool interpose::refuses(const Call &call, UErrorCode *error) {
  support::requests += error == nullptr ? 1 : 0;
  for (support::Fault &fault : support::world.faults) {
    if (fault.function == call.function && support::isNow(fault, call, error == nullptr)) {
      if (error != nullptr) {
        *error = fault.error;
      }
      return true;
    }
  }
  return false;
}

void interpose::opened(const void *handle) { support::handles.push_back(handle); }

extern "C" const char *uloc_getDefault() { return support::textOrNull(support::world.locale); }

extern "C" const char *ucnv_getDefaultName() {
  auto &names = support::world.codepages;
  static std::string name;
  name = names.front();
  if (names.size() > 1) {
    names.erase(names.begin());
  }
  return support::textOrNull(name);
}
