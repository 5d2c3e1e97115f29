// The words of a call, and all functions by name.
#pragma once

#include "nls2.h"
#include "support/exact.h"

#include <map>
#include <memory>
#include <string>
#include <type_traits>
#include <vector>

namespace support {

// A live locale object, released at the end of its scope.
class LiveLocale {
public:
  explicit LiveLocale(uint32_t codepage, const char *name = "en_US");
  ~LiveLocale() { NLS2_ReleaseLocale(object_); }
  LiveLocale(const LiveLocale &) = delete;
  LiveLocale &operator=(const LiveLocale &) = delete;

  NLS2_Locale *get() const { return object_; }

private:
  NLS2_Locale *object_;
};

using Names = std::map<const void *, std::string>;

// The words after a call's name, from 0.
class Words {
public:
  // The word "given" means the object `given`. If it is not null, an object that the call makes is
  // released at the end.
  explicit Words(const std::string &call, NLS2_Locale *given = nullptr);
  ~Words();
  Words(const Words &) = delete;
  Words &operator=(const Words &) = delete;

  // The word's bytes; '' is the empty word.
  const std::string &operator[](std::size_t i) const { return words_.at(i); }
  template <class Number = int32_t>
  Number number(std::size_t i) const {
    return static_cast<Number>(std::stoll(words_.at(i), nullptr, 0));
  }
  // A block of exactly these bytes. The word null is a null pointer.
  char *text(std::size_t i) const { return texts_.at(i).get(); }
  // L819, L819/de_DE: a live object with that code page. L0: an object that was never live. given,
  // null. A, B, C: the objects of the list in order. copy: a copy of A.
  NLS2_Locale *object(std::size_t i) const;

  // In an answer the pointer appears as {name}. The first name counts.
  void name(const void *pointer, const std::string &name) const {
    if (pointer != nullptr) {
      names_.emplace(pointer, name);
    }
  }
  Names &names() const { return names_; }
  // The call has made this object.
  void made(NLS2_Locale *object) const;

private:
  std::vector<std::string> words_;
  std::vector<std::unique_ptr<char[]>> texts_;
  std::map<std::string, std::unique_ptr<LiveLocale>> live_;
  NLS2_Locale unlisted_ = {};
  NLS2_Locale *given_;
  mutable NLS2_Locale *made_ = nullptr;
  mutable Names names_;
};

// The part of a pointer that an exit event or "%X" shows.
uint32_t low32(const void *pointer);

// A pointer as in an exit event: its low 32 bits as a signed number.
inline std::string shown(const void *pointer) {
  return std::to_string(static_cast<int32_t>(low32(pointer)));
}
template <class Number>
requires std::is_arithmetic_v<Number> std::string shown(Number number) {
  return std::to_string(static_cast<int64_t>(number));
}
// Bytes as in case files: blanks and everything that is not printable ASCII as \xHH or \0.
std::string shown(const std::string &bytes);
// "819 03480001 en_US": code page, language id, ICU's name.
std::string shown(const NLS2_Locale &object);

// All functions of the library, by their names in traces, and "lengths-by-byte". Each makes the call
// and returns its answer.
using Functions = std::map<std::string, std::string (*)(const Words &)>;
const Functions &functions();

// Replaces pointers in the text, in hex or as signed numbers, with their names.
std::string named(const std::string &text, const Names &names);

} // namespace support
