// realloc_mem, the one internal allocation routine, and the blocks that come from it.
#pragma once

#include "trace/frame.h"

#include <cstdint>
#include <cstdlib>
#include <memory>

namespace nls2::trace {

struct FreeBlock {
  void operator()(void *block) const { std::free(block); }
};

template <class Unit>
using Block = std::unique_ptr<Unit[], FreeBlock>;

// realloc(3) in its own trace frame. A failure is reported under the calling function's anchor and
// line; the old block is then as it was. Its trace events carry this name.
inline void *realloc_mem(TRC1_EntryBlock *caller, uint32_t line, void *old, uint32_t size) {
  static constinit TRC1_EntryBlock anchor = anchorOf("realloc_mem", TRC1_ENTRY_PRIVATE);
  const Frame frame(anchor);
  void *block = std::realloc(old, size);
  if (block == nullptr && frame.detail()) {
    TRC1_Printf(caller, line, "Memory allocation failure: Size(%lu), Old(%p)\n",
                static_cast<unsigned long>(size), old);
  }
  return block;
}

// A new block of `bytes` bytes, not cleared; null without memory, or if the size exceeds 32 bits.
template <class Unit>
Block<Unit> allocate(Trace trace, uint64_t bytes, uint32_t line = __builtin_LINE()) {
  if (bytes > UINT32_MAX) {
    return nullptr;
  }
  return Block<Unit>(static_cast<Unit *>(
      realloc_mem(trace.anchor(), line, nullptr, static_cast<uint32_t>(bytes))));
}

} // namespace nls2::trace
