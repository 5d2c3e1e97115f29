// Commands that answer a question by their exit code, as cmp and grep do.
#pragma once

#include "errors.h"

#include <new>

namespace nls2::tool {

// Runs `ask`; its false ends the command with exitNo. What makes other commands exit with
// exitFailed, the same number, is trouble here.
template <typename Ask>
void answer(Ask ask) {
  bool yes = false;
  try {
    yes = ask();
  } catch (const Failure &error) {
    throw Trouble(error.what());
  } catch (const std::bad_alloc &) {
    throw Trouble("out of memory");
  }
  if (!yes) {
    throw AlreadySaid{exitNo};
  }
}

} // namespace nls2::tool
