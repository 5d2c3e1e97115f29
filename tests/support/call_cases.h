// Calls of the library as cases. A case in a *.cases file may have these keys:
//
//   plain CALL -> ANSWER   a call without tracing, and again with detail lines
//   untraced CALL -> ...   a call without tracing only
//   call CALL              a call whose whole trace follows, on any number of lines:
//   | a detail line        dump bytes
//   calls NAME = value     a call of another function of the library, folded to this line
//   host lock              host unlock
//   = value, ANSWER        the exit event's value and the answer; once if they are the same
//   ... | A DETAIL LINE    skips everything before that line; at most once in a trace
//   or SETTING: REST       with this setting, the same call continues like this from here; lines are
//                          joined by blanks
//
// Settings: "default" and "codepages" (the process's defaults that ICU reports), "made" (how many
// locale objects exist before the call), "call" (another call), or the name of a function that fails
// (see support::Fault). In a case, settings come before calls.
//
// A CALL is the name of a function and its words (see words.h). An answer ends with everything that
// the call leaves behind: ICU handles, blocks, and locale objects, named by letters. Pointers appear
// as {name}: {locale} is the object of a word like L819 or L0; ICU handles are {converter} unless the
// call returns them.
#pragma once

#include <string>

namespace support {

// Runs every case of a file.
void expectCases(const std::string &file);

} // namespace support
