// The commands of nls2; each function adds one to the command line, with its options and its
// action.
#pragma once

#include <CLI/CLI.hpp>

namespace nls2::tool {

void addTranslateCommand(CLI::App &app);
void addLocalesCommand(CLI::App &app);
void addCodepagesCommand(CLI::App &app);
void addDetectCommand(CLI::App &app);
void addCatCommand(CLI::App &app);
void addCompareCommand(CLI::App &app);
void addSortCommand(CLI::App &app);
void addFindCommand(CLI::App &app);

} // namespace nls2::tool
