// Handles of libzelfields, and what its statuses mean to a command.
#pragma once

#include "base/errors.h"
#include "nls2_fields.h"

#include <memory>
#include <new>
#include <string>
#include <string_view>

namespace nls2::tool {

template <auto close>
struct Closes {
  void operator()(auto *handle) const { close(handle); }
};

using Page = std::shared_ptr<NLS2F_Page>;
using Translator = std::unique_ptr<NLS2F_Translator, Closes<NLS2F_CloseTranslator>>;
using Reader = std::unique_ptr<NLS2F_Reader, Closes<NLS2F_CloseReader>>;
using Writer = std::unique_ptr<NLS2F_Writer, Closes<NLS2F_CloseWriter>>;
using Layout = std::shared_ptr<NLS2F_Layout>;
using Collator = std::unique_ptr<NLS2F_Collator, Closes<NLS2F_CloseCollator>>;

// False if the text is the problem. Other failures are thrown.
inline bool isDone(int32_t status) {
  if (status == NLS2_ERR_NO_MEMORY || status == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc();
  }
  if (status > 0 && status != NLS2F_ERR_FIELD) {
    throw failure("{}", statusText(status));
  }
  return status <= 0;
}

// An empty struct of the interface, with its size.
template <class Struct>
Struct sized() {
  Struct made = {};
  made.size = sizeof made;
  return made;
}

inline std::string wordsOf(const NLS2F_Problem &problem,
                           const NLS2F_Translator *translator = nullptr) {
  char words[256] = "";
  isDone(NLS2F_DescribeProblem(translator, &problem, words, sizeof words));
  return words;
}

inline int64_t sizeOf(std::string_view bytes) { return static_cast<int64_t>(bytes.size()); }

inline std::string_view bytesOf(const void *bytes, const NLS2F_Span &span) {
  return {static_cast<const char *>(bytes) + span.offset, static_cast<std::size_t>(span.length)};
}

} // namespace nls2::tool
