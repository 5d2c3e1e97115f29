// Whole traces against known ones, which stand as text beside the tests.
#pragma once

#include "support/recording_host.h"

#include <string>
#include <utility>
#include <vector>

namespace support {

// Pointers and what stands for them in the known trace.
using Names = std::vector<std::pair<const void *, std::string>>;

// Expects the recorded trace to be the section of the room's traces.txt, which begins with the line
// "== section" and ends before the next such line or the file's end; blank lines do not count.
//
// A line is as Recording::lines has it. A pointer of `names` stands there as {name}, by its hex
// digits and as an exit value; a converter as {converter}, from the exit of
// NLS2_MapCodepageIdToName on.
void expectKnownTrace(const std::string &section, const Recording &recording,
                      const Names &names = {});

} // namespace support
