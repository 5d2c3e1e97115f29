// realloc_mem: the one internal allocation routine.

#include "trace/memory.h"

namespace nls2::trace {

void *realloc_mem(TRC1_EntryBlock *caller, uint32_t line, void *old, uint32_t size) {
  static constinit TRC1_EntryBlock anchor = anchorOf("realloc_mem", TRC1_ENTRY_PRIVATE);
  const Frame frame(anchor);
  // Taken before the call: with size 0 realloc frees the block, and `old` has no value any more.
  const auto oldAddress = reinterpret_cast<std::uintptr_t>(old);
  void *block = std::realloc(old, size);
  if (block == nullptr && frame.detail()) {
    TRC1_Printf(caller, line, "Memory allocation failure: Size(%lu), Old(%p)\n",
                static_cast<unsigned long>(size), reinterpret_cast<void *>(oldAddress));
  }
  return block;
}

} // namespace nls2::trace
