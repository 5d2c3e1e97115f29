// Calls of the library as cases. In a room's *.cases files these keys stand in a case:
//
//   plain CALL -> ANSWER   a call without tracing, and once more with detail lines
//   call CALL              a call whose whole trace follows, on as many lines as read well:
//   | a detail line        dump bytes
//   calls NAME = value     a function of the library called inside, folded to this line
//   icu NAME               a call of ICU's; host lock; host unlock
//   = value, ANSWER        the exit event and the answer; the value alone where they are one
//   ... | A DETAIL LINE    whatever comes before that line; at most one in a trace
//   or SETTING: REST       from here the same call under that setting goes on like this instead,
//                          its lines joined by blanks
//
// Settings: "default" and "codepages" (what ICU says of the process), "made" (locale objects made
// before), "call" (another call) or the name of a function that fails, as support::Fault has it. In
// a case they come before its calls.
//
// A CALL is a name of the room's functions and its words. An answer ends in what the call leaves
// behind: "converters left 2", and the locale objects that are named by a letter. Pointers appear
// as {name}: {locale} is the object that a word L819 asks for, with code page 819; L0 is not live.
#pragma once

#include "nls2.h"
#include "support/exact.h"
#include "support/probe.h"

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

namespace support {

// A live object of the test's own: a code page and a short POSIX name of localeMap.
class LiveLocale {
public:
  explicit LiveLocale(uint32_t codepage, const char *name = "en_US");
  ~LiveLocale();
  LiveLocale(const LiveLocale &) = delete;
  LiveLocale &operator=(const LiveLocale &) = delete;

  NLS2_Locale *get() const { return object_; }

private:
  NLS2_Locale *object_;
};

using Names = std::map<const void *, std::string>;

// The words behind a call's name, from 0.
class Words {
public:
  explicit Words(const std::string &call);

  std::size_t size() const { return words_.size(); }
  // The bytes that the word stands for; '' is empty.
  const std::string &operator[](std::size_t i) const { return words_.at(i); }
  template <class Number = int32_t>
  Number number(std::size_t i) const {
    return static_cast<Number>(std::stoll(words_.at(i), nullptr, 0));
  }
  // A block of exactly those bytes; null is a null pointer.
  char *text(std::size_t i) const { return texts_.at(i).get(); }
  // A, B, C: in the order of the list; null; never, an object that was never live; copy, one of A;
  // or as the word L819 says.
  NLS2_Locale *object(std::size_t i) const;
  // Gives a pointer its name in the trace, unless it has one.
  void name(const void *pointer, const std::string &name) const {
    if (pointer != nullptr) {
      names_.emplace(pointer, name);
    }
  }
  Names &names() const { return names_; }

private:
  std::vector<std::string> words_;
  std::vector<std::unique_ptr<char[]>> texts_;
  std::map<std::string, std::unique_ptr<LiveLocale>> live_;
  mutable Names names_;
};

// As an exit event has it: a pointer's low 32 bits, as a number with a sign.
inline std::string shown(const void *pointer) {
  return std::to_string(static_cast<int32_t>(reinterpret_cast<uintptr_t>(pointer)));
}
template <class Number>
requires std::is_arithmetic_v<Number> std::string shown(Number number) {
  return std::to_string(static_cast<int64_t>(number));
}
// Bytes as case files have them: what is not printable ASCII, and the blank, as \xHH or \0.
std::string shown(const std::string &bytes);
// "819 en_US 03480001": code page, ICU's name, language id.
std::string shown(const NLS2_Locale &object);

// By name: the call, which returns its answer.
using Functions = std::map<std::string, std::function<std::string(const Words &)>>;

// Runs every case of a folder. Actual texts of those that fail go to the build folder.
void expectCases(const std::string &folder, const Functions &functions);

// A table's fingerprint: FNV-1a over bytes, and over numbers as four bytes, the lowest first.
struct Digest {
  uint64_t value = 0xCBF29CE484222325;

  template <std::size_t size>
  Digest &bytes(const char (&bytes)[size]) {
    for (const char byte : bytes) {
      value = (value ^ static_cast<unsigned char>(byte)) * 0x100000001B3;
    }
    return *this;
  }
  Digest &number(uint32_t number) {
    const auto byte = [=](int i) { return static_cast<char>(number >> (8 * i)); };
    return bytes({byte(0), byte(1), byte(2), byte(3)});
  }
};

} // namespace support
