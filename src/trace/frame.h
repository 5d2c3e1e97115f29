// The trace frame that every function of the library runs in.
#pragma once

#include "trc1.h"

#include <cstddef>
#include <cstdint>

namespace nls2::trace {

// One unit block and one sync word serve the whole library.
extern TRC1_UnitBlock unit;
extern uint32_t syncWord;

// The anchor of the function that opens on the calling line; keep it in a static constinit
// variable.
template <std::size_t Size>
consteval TRC1_EntryBlock anchorOf(const char (&name)[Size],
                                   uint32_t attributes = TRC1_ENTRY_EXPORTED,
                                   uint32_t line = __builtin_LINE()) {
  return {&unit, name, static_cast<uint32_t>(Size - 1), line, &syncWord, attributes, 0, 0, {0, 0}};
}

// What an event or a `%X` carries of a pointer.
inline uint32_t low32(const void *pointer) {
  return static_cast<uint32_t>(reinterpret_cast<std::uintptr_t>(pointer));
}

// A null text prints as "(null)" on every host.
inline const char *text(const char *string) { return string != nullptr ? string : "(null)"; }

inline uint32_t exitValue(const void *pointer) { return low32(pointer); }
inline uint32_t exitValue(uint32_t value) { return value; }
inline uint32_t exitValue(int32_t value) { return static_cast<uint32_t>(value); }

// Where the detail lines of one call go, if anywhere. Two words. Pass it by value: as long as
// the frame's address is not taken, it stays in registers.
class Trace {
public:
  Trace(TRC1_EntryBlock &anchor, uint32_t flags) : anchor_(&anchor), flags_(flags) {}

  bool detail() const { return (flags_ & TRC1_FLAG_DETAIL) != 0; }
  TRC1_EntryBlock *anchor() const { return anchor_; }

  void dump(const void *address, uint32_t length, uint32_t line = __builtin_LINE()) const {
    if (detail()) [[unlikely]] {
      TRC1_Dump(anchor_, line, address, length, 0);
    }
  }

protected:
  bool events() const { return (flags_ & TRC1_FLAG_EVENTS) != 0; }

private:
  TRC1_EntryBlock *anchor_;
  uint32_t flags_;
};

// One call of one function: the entry event, the flags that hold for the whole call, and exactly
// one exit event. The exit event is emitted by the destructor, so it follows the release of
// everything that was declared after the frame.
class Frame : public Trace {
public:
  // True if a frame of this anchor would trace nothing and need not ask the host.
  static bool isOff(const TRC1_EntryBlock &anchor) {
    return isCurrent(anchor) && __atomic_load_n(&anchor.cachedFlags, __ATOMIC_RELAXED) == 0;
  }

  explicit Frame(TRC1_EntryBlock &anchor) : Trace(anchor, currentFlags(anchor)) {
    if (events()) [[unlikely]] {
      TRC1_Event(&anchor, anchor.entryLine, TRC1_EVENT_ENTRY);
    }
  }
  ~Frame() {
    if (events()) [[unlikely]] {
      if (exitLine_ != 0) {
        TRC1_Event(anchor(), exitLine_, TRC1_EVENT_EXIT_VALUE, exitValue_);
      } else {
        TRC1_Event(anchor(), anchor()->entryLine, TRC1_EVENT_EXIT);
      }
    }
  }
  Frame(const Frame &) = delete;
  Frame &operator=(const Frame &) = delete;

  // The exit event will carry this value; without a call of `result` it carries none.
  template <class Value>
  Value result(Value value, uint32_t line = __builtin_LINE()) {
    exitValue_ = exitValue(value);
    exitLine_ = line;
    return value;
  }

private:
  // The anchor's cached words and the sync word are shared by all threads and written by the host.
  static bool isCurrent(const TRC1_EntryBlock &anchor) {
    const uint32_t *sync = __atomic_load_n(&anchor.sync, __ATOMIC_RELAXED);
    return __atomic_load_n(sync, __ATOMIC_RELAXED) ==
           __atomic_load_n(&anchor.cachedSync, __ATOMIC_RELAXED);
  }
  static uint32_t currentFlags(TRC1_EntryBlock &anchor) {
    if (isCurrent(anchor)) [[likely]] {
      return __atomic_load_n(&anchor.cachedFlags, __ATOMIC_RELAXED);
    }
    return TRC1_Sync(&anchor);
  }

  uint32_t exitValue_ = 0;
  uint32_t exitLine_ = 0; // 0: leaves without a value
};

} // namespace nls2::trace

// One detail line. A macro, so that the compiler checks the arguments against the format and
// computes none of them while detail tracing is off.
#define NLS2_TRACE(trace, format, ...)                                                             \
  do {                                                                                             \
    if ((trace).detail()) [[unlikely]] {                                                           \
      TRC1_Printf((trace).anchor(), __LINE__, format "\n" __VA_OPT__(, ) __VA_ARGS__);             \
    }                                                                                              \
  } while (false)
