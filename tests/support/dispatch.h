// Calls a function of the library with the words of a call: one word for each parameter, except
// int32_t * and void *. The answer is the result and then all outputs, in the order of the parameters.
#pragma once

#include "support/words.h"

#include <tuple>
#include <unicode/unistr.h>
#include <unicode/ures.h>
#include <unicode/ustdio.h>

namespace support {

// Called with true before each call of the library, and with false after it.
inline void (*aroundCall)(bool isBefore) = [](bool /*isBefore*/) {};

struct Cursor {
  const Words &words;
  std::size_t next = 0;
};

// The argument for a parameter, and its part of the answer.
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
struct Slot<Unit *> { // char and UChar, also constant ones
  explicit Slot(Cursor &at) : bytes(at.words.text(at.next)), size(at.words[at.next].size()) {
    at.words.name(bytes, "word " + shown(at.next++));
  }
  Unit *get() const { return reinterpret_cast<Unit *>(bytes); }
  std::string answer() const {
    return std::is_same_v<Unit, char> ? ", " + shown(std::string(bytes, size)) : "";
  }
  char *bytes;
  std::size_t size;
};

// The word "new" is an object of zero bytes; the answer shows it after the call.
template <>
struct Slot<NLS2_Locale *> {
  explicit Slot(Cursor &at) : isNew(at.words[at.next++] == "new") {
    live = isNew ? nullptr : at.words.object(at.next - 1);
  }
  NLS2_Locale *get() { return isNew ? &fresh : live; }
  std::string answer() const { return isNew ? ", " + shown(fresh) : ""; }
  NLS2_Locale fresh = {};
  NLS2_Locale *live;
  bool isNew;
};
template <>
struct Slot<const NLS2_Locale *> : Given<const NLS2_Locale *> {
  explicit Slot(Cursor &at) : Given{at.words.object(at.next++)} {}
};

// The word "file" is a new stream. "!" is one that the library closes; null is none.
template <>
struct Slot<UFILE *> : Given<UFILE *> {
  explicit Slot(Cursor &at)
      : Given{at.words[at.next] == "null" ? nullptr : u_fopen("/dev/null", "w", nullptr, "UTF-8")},
        owned(at.words[at.next++] == "file" ? value : nullptr) {
    at.words.name(value, "file");
  }
  icu::LocalUFILEPointer owned;
};

// The example bundle of a language. With "!" before the name, the library closes it.
template <>
struct Slot<UResourceBundle *> : Given<UResourceBundle *> {
  explicit Slot(Cursor &at) : Given{nullptr} {
    const std::string &word = at.words[at.next++];
    UErrorCode error = U_ZERO_ERROR;
    value = ures_open("./messages", word.c_str() + (word[0] == '!' ? 1 : 0), &error);
    owned.adoptInstead(word[0] == '!' ? nullptr : value);
  }
  icu::LocalUResourceBundlePointer owned;
};

template <>
struct Slot<const UResourceBundle *> : Slot<UResourceBundle *> {
  using Slot<UResourceBundle *>::Slot;
};

// A result in an answer. Pointers get names; handles are closed.
template <class Result>
std::string answered(const Words &words, Result result) {
  if constexpr (std::is_same_v<Result, UConverter *>) {
    words.name(result, "converter");
    ucnv_close(result);
  } else if constexpr (std::is_same_v<Result, UFILE *>) {
    words.name(result, "file");
    u_fclose(result);
  } else if constexpr (std::is_same_v<Result, UResourceBundle *>) {
    words.name(result, "bundle");
    ures_close(result);
  } else if constexpr (std::is_same_v<Result, NLS2_Locale *>) {
    words.made(result);
  } else if constexpr (std::is_same_v<Result, const LocaleMapEntry *>) {
    words.name(result, "row " + shown(result - localeMap));
  } else if constexpr (std::is_pointer_v<Result>) { // a text
    std::string text;
    words.name(result, icu::UnicodeString(result).toUTF8String(text));
  }
  return shown(result);
}

template <class Result, class... Parameters>
std::string dispatch(Result (*function)(Parameters...), const Words &words) {
  [[maybe_unused]] Cursor at{words};
  std::tuple<Slot<Parameters>...> slots{Slot<Parameters>(at)...};
  return std::apply(
      [&](auto &...slot) {
        aroundCall(true);
        if constexpr (std::is_void_v<Result>) {
          function(slot.get()...);
          aroundCall(false);
          return ("done" + ... + slot.answer());
        } else {
          const Result result = function(slot.get()...);
          aroundCall(false);
          return (answered(words, result) + ... + slot.answer());
        }
      },
      slots);
}

template <auto function>
std::string call(const Words &words) {
  return dispatch(function, words);
}

} // namespace support
