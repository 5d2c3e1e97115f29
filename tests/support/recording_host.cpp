// The recording host.

#include "support/recording_host.h"

#include "nls2.h"
#include "sys1.h"
#include "trc1.h"

#include <atomic>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <mutex>

namespace {

std::mutex recordMutex;
std::vector<std::string> recorded;
bool recording = false;

std::map<std::string, support::SeenFunction> seenFunctions;

// Every change of the flags changes this word, which anchors are pointed at by their first sync.
std::atomic<uint32_t> currentFlags{0};
uint32_t hostSync = 2;

std::mutex listMutex;

std::string nameOf(const TRC1_EntryBlock *anchor) {
  return {anchor->functionName, anchor->functionNameLength};
}

// Adds a line to the recording that is open, if any.
void mark(const std::string &line) {
  const std::lock_guard<std::mutex> guard(recordMutex);
  if (recording) {
    recorded.push_back(line);
  }
}

void setFlags(uint32_t flags) {
  currentFlags = flags;
  __atomic_add_fetch(&hostSync, 1, __ATOMIC_RELAXED);
}

} // namespace

namespace support {

Recording::Recording(TraceFlags flags) {
  const std::lock_guard<std::mutex> guard(recordMutex);
  recorded.clear();
  recording = true;
  setFlags(flags);
}

Recording::~Recording() {
  const std::lock_guard<std::mutex> guard(recordMutex);
  recording = false;
  setFlags(traceOff);
}

std::vector<std::string> Recording::lines() const {
  const std::lock_guard<std::mutex> guard(recordMutex);
  return recorded;
}

SeenFunction seen(const std::string &function) {
  const std::lock_guard<std::mutex> guard(recordMutex);
  return seenFunctions[function];
}

void changeSyncWord() { setFlags(currentFlags); }

} // namespace support

uint32_t TRC1_Sync(TRC1_EntryBlock *anchor) {
  {
    const std::lock_guard<std::mutex> guard(recordMutex);
    support::SeenFunction &function = seenFunctions[nameOf(anchor)];
    if (function.syncs++ == 0) {
      function.anchor = anchor;
      function.atFirstSync = *anchor;
      function.wordAtFirstSync = *anchor->sync;
    }
  }
  __atomic_store_n(&anchor->sync, &hostSync, __ATOMIC_RELAXED);
  const uint32_t sync = __atomic_load_n(&hostSync, __ATOMIC_RELAXED);
  const uint32_t flags = currentFlags;
  __atomic_store_n(&anchor->cachedFlags, flags, __ATOMIC_RELAXED);
  __atomic_store_n(&anchor->cachedSync, sync, __ATOMIC_RELAXED);
  return flags;
}

void TRC1_Event(TRC1_EntryBlock *anchor, uint32_t line, uint32_t kind, ...) {
  if (kind == TRC1_EVENT_ENTRY) {
    const std::lock_guard<std::mutex> guard(recordMutex);
    seenFunctions[nameOf(anchor)].entryEventLine = line;
  }
  std::string text = nameOf(anchor) + (kind == TRC1_EVENT_ENTRY ? "> entry" : "=");
  if (kind == TRC1_EVENT_EXIT_VALUE) {
    va_list arguments;
    va_start(arguments, kind);
    text += " " + std::to_string(static_cast<int32_t>(va_arg(arguments, uint32_t)));
    va_end(arguments);
  }
  mark(text);
}

void TRC1_Printf(TRC1_EntryBlock *anchor, uint32_t /*line*/, const char *format, ...) {
  char *line = nullptr;
  va_list arguments;
  va_start(arguments, format);
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-nonliteral"
  const int length = vasprintf(&line, format, arguments);
#pragma GCC diagnostic pop
  va_end(arguments);
  const std::string text(line, static_cast<std::size_t>(length));
  std::free(line);
  mark(nameOf(anchor) + ": " +
       (text.ends_with('\n') ? text.substr(0, text.size() - 1) : text + "(no newline)"));
}

void TRC1_Dump(TRC1_EntryBlock *anchor, uint32_t /*line*/, const void *address, uint32_t length,
               uint32_t zero) {
  std::string text = nameOf(anchor) + "#";
  for (uint32_t i = 0; i < length; ++i) {
    char digits[4];
    std::snprintf(digits, sizeof digits, " %02X", static_cast<const unsigned char *>(address)[i]);
    text += digits;
  }
  mark(zero == 0 ? text : text + " (last argument not 0)");
}

void SYS1_GetLock(void *lock) {
  listMutex.lock();
  mark(lock == &LocaleObjectList_Lock ? "host lock" : "host lock of another");
}

void SYS1_ReleaseLock(void *lock) {
  mark(lock == &LocaleObjectList_Lock ? "host unlock" : "host unlock of another");
  listMutex.unlock();
}
