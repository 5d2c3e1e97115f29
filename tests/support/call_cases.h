// Calls of the library as cases. In a *.cases file these keys stand in a case:
//
//   plain CALL -> ANSWER   a call without tracing, and once more with detail lines
//   untraced CALL -> ...   the same without tracing alone
//   call CALL              a call whose whole trace follows, on as many lines as read well:
//   | a detail line        dump bytes
//   calls NAME = value     a function of the library called inside, folded to this line
//   host lock              host unlock
//   = value, ANSWER        the exit event's value and the answer; once if they are the same
//   ... | A DETAIL LINE    whatever comes before that line; at most one in a trace
//   or SETTING: REST       from here the same call under that setting goes on like this instead,
//                          its lines joined by blanks
//
// Settings: "default" and "codepages" (what ICU reports of the process), "made" (locale objects made
// before), "call" (another call) or the name of a function that fails, as support::Fault has it. In
// a case they come before its calls.
//
// A CALL is the name of a function and its words. An answer ends in what the call leaves behind:
// handles of ICU, blocks, and the locale objects that a letter names. Pointers appear as {name}:
// {locale} is the object of a word like L819 or L0, and ICU's handles are {converter} unless the call
// returns them.
#pragma once

#include <string>

namespace support {

// Runs every case of a file.
void expectCases(const std::string &file);

} // namespace support
