// Opens and closes layouts, and tells what their fields are.
#include "layout/layout.h"

#include <memory>

using namespace zelfields;

int32_t NLS2F_OpenLayout(const char *text, int64_t length, const NLS2F_Page *page, uint32_t options,
                         NLS2F_Layout **layout, NLS2F_Problem *problem) {
  if (!cleared(layout) || !isRange(text, length) || page == nullptr || !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  if ((options & ~uint32_t{NLS2F_LAYOUT_SHORT | NLS2F_LAYOUT_WRITES}) != 0) {
    return NLS2_ERR_INVALID_OPTION;
  }
  return guarded([&]() -> int32_t {
    auto made = std::make_unique<NLS2F_Layout>();
    ProblemFacts fault;
    if (!parseLayout(viewOf(text, length), *page, options, *made, fault)) {
      return setProblem(problem, fault);
    }
    *layout = made.release();
    return 0;
  });
}

void NLS2F_CloseLayout(NLS2F_Layout *layout) { delete layout; }

int32_t NLS2F_LayoutSize(const NLS2F_Layout *layout, int64_t *fields, int64_t *length) {
  if (!cleared(fields, length) || layout == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  *fields = static_cast<int64_t>(layout->entries.size());
  *length = layout->length;
  return 0;
}

int32_t NLS2F_LayoutField(const NLS2F_Layout *layout, int64_t index, NLS2F_Field *field) {
  if (layout == nullptr || !isWhole(field) || index < 0 ||
      index >= static_cast<int64_t>(layout->entries.size())) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  const NLS2F_Layout::Entry &entry = layout->entries[static_cast<std::size_t>(index)];
  const uint32_t size = field->size;
  *field = entry.field;
  field->size = size;
  field->name = entry.name.c_str();
  field->page = entry.page.empty() ? nullptr : entry.page.c_str();
  return 0;
}
