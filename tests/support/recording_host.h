// A host for the library that records its calls. A program that links it does not use the default
// host, because the program's own definitions win.
#pragma once

#include "trc1.h"

#include <cstdint>
#include <string>
#include <vector>

namespace support {

constexpr uint32_t traceOff = 0;
constexpr uint32_t traceDetail = TRC1_FLAG_DETAIL;
constexpr uint32_t traceEvents = TRC1_FLAG_EVENTS;
constexpr uint32_t traceAll = traceDetail | traceEvents;

// Sets the trace flags and collects the trace until it goes out of scope. Without a Recording, tracing
// is off. Use one at a time.
//
// A line is one trace call, written as
//   NLS2_Name> entry            NLS2_Name= 37        NLS2_Name=
//   NLS2_Name: detail text      NLS2_Name# C1 C2     (a dump)
// with exit values as signed numbers. Calls of the lock appear in between, as "host lock" and
// "host unlock".
class Recording {
public:
  explicit Recording(uint32_t flags);
  ~Recording();
  Recording(const Recording &) = delete;
  Recording &operator=(const Recording &) = delete;

  std::vector<std::string> lines() const;
};

// What the host has seen of one function; all zero before its first sync.
struct SeenFunction {
  TRC1_EntryBlock *anchor;
  TRC1_EntryBlock atFirstSync; // a copy of the anchor
  uint32_t wordAtFirstSync;    // the word that its sync pointer pointed to
  unsigned syncs;
  uint32_t entryEventLine;
};
SeenFunction seen(const std::string &function);
// Changes the word that the anchors' sync pointers now point to, but not the flags.
void changeSyncWord();

} // namespace support
