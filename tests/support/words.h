// The words of a call: its name, and what its arguments are.
#pragma once

#include "nls2.h"
#include "support/exact.h"

#include <map>
#include <memory>
#include <string>
#include <type_traits>
#include <vector>

namespace support {

// A live object of the test's own: a code page and a short POSIX name of localeMap.
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
  // `given` is the object that the word "given" stands for. With it, objects that the call makes are
  // released at the end.
  explicit Words(const std::string &call, NLS2_Locale *given = nullptr);
  ~Words();
  Words(const Words &) = delete;
  Words &operator=(const Words &) = delete;

  // The bytes that the word stands for; '' is empty.
  const std::string &operator[](std::size_t i) const { return words_.at(i); }
  template <class Number = int32_t>
  Number number(std::size_t i) const {
    return static_cast<Number>(std::stoll(words_.at(i), nullptr, 0));
  }
  // A block of exactly those bytes; null is a null pointer.
  char *text(std::size_t i) const { return texts_.at(i).get(); }
  // L819 and L819/de_DE: a live object of that code page; L0: an object that was never live; given;
  // null; A, B, C: in the order of the list; copy: a copy of A.
  NLS2_Locale *object(std::size_t i) const;

  // Pointers appear in an answer by their first name, as {name}.
  void name(const void *pointer, const std::string &name) const {
    if (pointer != nullptr) {
      names_.emplace(pointer, name);
    }
  }
  Names &names() const { return names_; }
  // An object that the call has made.
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

// What an exit event or "%X" carries of a pointer.
uint32_t low32(const void *pointer);

// As an exit event has it: a pointer's low 32 bits, as a number with a sign.
inline std::string shown(const void *pointer) {
  return std::to_string(static_cast<int32_t>(low32(pointer)));
}
template <class Number>
requires std::is_arithmetic_v<Number> std::string shown(Number number) {
  return std::to_string(static_cast<int64_t>(number));
}
// Bytes as case files have them: what is not printable ASCII, and the blank, as \xHH or \0.
std::string shown(const std::string &bytes);
// "819 03480001 en_US": code page, language id, ICU's name.
std::string shown(const NLS2_Locale &object);

// Every function of the library by the name that it has in traces, and "lengths-by-byte": makes the
// call and returns its answer.
using Functions = std::map<std::string, std::string (*)(const Words &)>;
const Functions &functions();

// The text with pointers, in hex or as signed numbers, replaced by their names.
std::string named(const std::string &text, const Names &names);

} // namespace support
