// A call under given answers of ICU's: what it says, its whole trace, and the objects that it
// leaves.
#pragma once

#include "nls2.h"
#include "support/default_probe.h"

#include <functional>
#include <sstream>
#include <string>

namespace support {

enum Trace { plain, traced }; // without tracing, or with the whole trace compared

struct Scenario {
  std::string name; // if traced, the section of the known traces
  Trace trace = plain;
  std::function<std::string()> call = {};
  std::string answer = {};
  std::string left = {}; // the live objects afterwards, as in "A en_US 03480001 1208"
  Answers answers = {};
  int made = 0; // objects made before, en_US with code page 1208
};

// Expects it, and releases the objects that are left. Objects are called A, B, C as they are made;
// `never` is called so.
void expectScenario(const Scenario &scenario);

// The nth live object, from 0.
NLS2_Locale *live(int nth);
// One that was never made.
extern NLS2_Locale never;

// "en_US 03480001 1208": ICU locale, language id, code page.
std::string described(const NLS2_Locale &object);

// The values with blanks between.
template <class First, class... Rest>
std::string said(const First &first, const Rest &...rest) {
  std::ostringstream text;
  text << first;
  ((text << ' ' << rest), ...);
  return text.str();
}

} // namespace support
