// The recording host.

#include "support/recording_host.h"

#include "nls2.h"
#include "sys1.h"

#include <algorithm>
#include <atomic>
#include <cstdarg>
#include <cstdio>
#include <map>
#include <mutex>

namespace {

using Guard = std::lock_guard<std::mutex>;

std::mutex recordMutex; // for these three
std::vector<std::string> recorded;
bool isRecording = false;
std::map<std::string, support::SeenFunction> functions;

// Anchors point to this word after their first sync. It changes with the flags.
std::atomic<uint32_t> currentFlags{0};
uint32_t hostSync = 2;

std::mutex listMutex;

std::string nameOf(const TRC1_EntryBlock *anchor) {
  return {anchor->functionName, anchor->functionNameLength};
}

void record(const std::string &line) {
  const Guard guard(recordMutex);
  if (isRecording) {
    recorded.push_back(line);
  }
}

} // namespace

namespace support {

Recording::Recording(uint32_t flags) {
  const Guard guard(recordMutex);
  recorded.clear();
  isRecording = true;
  currentFlags = flags;
  changeSyncWord();
}

Recording::~Recording() {
  const Guard guard(recordMutex);
  isRecording = false;
  currentFlags = 0;
  changeSyncWord();
}

std::vector<std::string> Recording::lines() const {
  const Guard guard(recordMutex);
  return recorded;
}

SeenFunction seen(const std::string &function) {
  const Guard guard(recordMutex);
  return functions[function];
}

void changeSyncWord() { __atomic_add_fetch(&hostSync, 1, __ATOMIC_RELAXED); }

} // namespace support

uint32_t TRC1_Sync(TRC1_EntryBlock *anchor) {
  {
    const Guard guard(recordMutex);
    support::SeenFunction &function = functions[nameOf(anchor)];
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
    const Guard guard(recordMutex);
    functions[nameOf(anchor)].entryEventLine = line;
  }
  std::string text = nameOf(anchor) + (kind == TRC1_EVENT_ENTRY ? "> entry" : "=");
  if (kind == TRC1_EVENT_EXIT_VALUE) {
    va_list arguments;
    va_start(arguments, kind);
    text += " " + std::to_string(static_cast<int32_t>(va_arg(arguments, uint32_t)));
    va_end(arguments);
  }
  record(text);
}

void TRC1_Printf(TRC1_EntryBlock *anchor, uint32_t /*line*/, const char *format, ...) {
  char text[4096]; // no case has more
  va_list arguments;
  va_start(arguments, format);
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-nonliteral"
  const int length = std::min(vsnprintf(text, sizeof text, format, arguments), 4095);
#pragma GCC diagnostic pop
  va_end(arguments);
  const bool isLine = length > 0 && text[length - 1] == '\n';
  text[isLine ? length - 1 : length] = '\0';
  record(nameOf(anchor) + ": " + text + (isLine ? "" : "(no newline)"));
}

void TRC1_Dump(TRC1_EntryBlock *anchor, uint32_t /*line*/, const void *address, uint32_t length,
               uint32_t zero) {
  std::string text = nameOf(anchor) + "#";
  for (uint32_t i = 0; i < length; ++i) {
    char digits[4];
    std::snprintf(digits, sizeof digits, " %02X", static_cast<const unsigned char *>(address)[i]);
    text += digits;
  }
  record(zero == 0 ? text : text + " (last argument not 0)");
}

void SYS1_GetLock(void *lock) {
  listMutex.lock();
  record(lock == &LocaleObjectList_Lock ? "host lock" : "host lock of another");
}

void SYS1_ReleaseLock(void *lock) {
  record(lock == &LocaleObjectList_Lock ? "host unlock" : "host unlock of another");
  listMutex.unlock();
}
