// Calls a function of the library with a case's words, one for each parameter but int32_t and void
// pointers. The answer is the result and what the call wrote through pointers, in their order.
#pragma once

#include "support/call_cases.h"

#include <tuple>

namespace support {

struct Cursor {
  const Words &words;
  std::size_t next = 0;
};

// What a parameter gets, and what it adds to the answer.
template <class Value>
struct Given {
  Value value;
  Value get() const { return value; }
  std::string answer() const { return ""; }
};

template <class Number>
struct Slot : Given<Number> {
  explicit Slot(Cursor &at) : Given<Number>{at.words.number<Number>(at.next++)} {}
};

template <>
struct Slot<int32_t *> {
  explicit Slot(Cursor & /*at*/) {}
  std::string answer() const { return ", " + shown(written); }
  int32_t *get() { return &written; }
  int32_t written = 99;
};

template <>
struct Slot<const void *> : Given<const void *> {
  explicit Slot(Cursor & /*at*/) : Given{nullptr} {}
};

template <class Unit>
struct TextSlot {
  explicit TextSlot(Cursor &at) : bytes(at.words.text(at.next)), size(at.words[at.next].size()) {
    at.words.name(bytes, "word " + shown(at.next++));
  }
  Unit *get() const { return reinterpret_cast<Unit *>(bytes); }
  std::string answer() const {
    return std::is_same_v<Unit, char> ? ", " + shown(std::string(bytes, size)) : "";
  }
  char *bytes;
  std::size_t size;
};
template <class Unit>
struct Slot<Unit *> : TextSlot<Unit> { // char and UChar, also constant ones
  using TextSlot<Unit>::TextSlot;
};

template <>
struct Slot<NLS2_Locale *> : Given<NLS2_Locale *> {
  explicit Slot(Cursor &at) : Given{at.words.object(at.next++)} {}
};
template <>
struct Slot<const NLS2_Locale *> : Slot<NLS2_Locale *> {
  using Slot<NLS2_Locale *>::Slot;
};

template <class Result, class... Parameters>
std::string dispatch(Result (*function)(Parameters...), const Words &words) {
  [[maybe_unused]] Cursor at{words};
  std::tuple<Slot<Parameters>...> slots{Slot<Parameters>(at)...};
  return std::apply(
      [&](auto &...slot) {
        if constexpr (std::is_void_v<Result>) {
          function(slot.get()...);
          return ("done" + ... + slot.answer());
        } else {
          const std::string result = shown(function(slot.get()...));
          return (result + ... + slot.answer());
        }
      },
      slots);
}

template <auto function>
std::string call(const Words &words) {
  return dispatch(function, words);
}

// A row of a room's functions.
#define CALL(function)                                                                             \
  { #function, support::call < function> }

} // namespace support
