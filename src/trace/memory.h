// The library's one way to a work buffer.
#pragma once

#include "trace/frame.h"

#include <cstdlib>
#include <memory>

namespace nls2::trace {

struct FreeBlock {
  void operator()(void *block) const { std::free(block); }
};

template <class Unit>
using Block = std::unique_ptr<Unit[], FreeBlock>;

// realloc(3), run in a trace frame of its own. A failure is reported under the calling function's
// anchor and line; the old block is then as it was. The name is the one that its trace events
// carry.
void *realloc_mem(TRC1_EntryBlock *caller, uint32_t line, void *old, uint32_t size);

// A new block of `bytes` bytes, not cleared; null also for a size that 32 bits cannot carry.
template <class Unit>
Block<Unit> allocate(Trace trace, uint64_t bytes, uint32_t line = __builtin_LINE()) {
  if (bytes > UINT32_MAX) {
    return nullptr;
  }
  return Block<Unit>(static_cast<Unit *>(
      realloc_mem(trace.anchor(), line, nullptr, static_cast<uint32_t>(bytes))));
}

} // namespace nls2::trace
