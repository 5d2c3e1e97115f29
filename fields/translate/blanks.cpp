// The blanks after a text: their bytes, and how many of them a policy calls for.
#include "translate/blanks.h"

#include "pages/page.h"
#include "pages/page_traits.h"
#include "translate/replacement.h"

#include <algorithm>
#include <cstring>
#include <unicode/utf16.h>

namespace zelfields {

void Blanks::learn(icu::LocalUConverterPointer &to, const Replacements &replaced) {
  const int64_t before = replaced.total();
  std::array<char, 64> written = {};
  int64_t sizes[2] = {};
  for (std::size_t blanks = 1; blanks <= 2; ++blanks) {
    Encoder encoder(restart(to), {written.data(), static_cast<int64_t>(written.size())});
    if (!encoder.add({u"  ", blanks}) || !encoder.finish()) {
      return;
    }
    sizes[blanks - 1] = encoder.size();
  }
  size_ = std::min<int64_t>(sizes[1] - sizes[0], static_cast<int64_t>(bytes_.size()));
  std::memcpy(bytes_.data(), written.data() + sizes[0], static_cast<std::size_t>(size_));
  isReplaced_ = replaced.total() != before;
  dependOnText_ = leavesModesOpen(ucnv_getType(to.getAlias()));
  firstBringsMore_ = sizes[0] != size_;
}

bool Blanks::dependOn(std::u16string_view text) const {
  // Half a pair is one thing before a blank and another at the end of all.
  return dependOnText_ || (text.empty() ? firstBringsMore_ : U16_IS_LEAD(text.back()));
}

int64_t Blanks::count(const NLS2F_Policy &policy, const Sizes &sizes, int64_t cut) {
  const int64_t each = std::max<int64_t>(sizes.each(), 1);
  const int64_t beyondTwo = policy.width == 0              ? cut
                            : policy.width > sizes.with[2] ? (policy.width - sizes.with[2]) / each
                                                           : 0;
  switch (policy.padding) {
  case NLS2F_FILL:
    for (const int64_t few : {0, 1}) {
      if (sizes.of(few) == policy.width) {
        return few;
      }
    }
    return sizes.of(2 + beyondTwo) == policy.width ? 2 + beyondTwo : cannot;
  case NLS2F_KEEP_BLANKS: {
    int64_t most = std::min(cut, 2 + beyondTwo);
    while (policy.width != 0 && most > 0 && sizes.of(most) > policy.width) {
      --most;
    }
    return most;
  }
  default:
    return 0;
  }
}

int64_t Blanks::nextShorter(const NLS2F_Policy &policy, const Sizes &sizes) {
  NLS2F_Policy most = policy;
  most.padding = NLS2F_KEEP_BLANKS;
  return sizes.of(count(most, sizes, policy.width));
}

void Blanks::put(char *target, int64_t count) const {
  if (size_ == 1) {
    std::memset(target, bytes_[0], static_cast<std::size_t>(count));
    return;
  }
  for (int64_t i = 0; i < count; ++i) {
    std::memcpy(target + i * size_, bytes_.data(), static_cast<std::size_t>(size_));
  }
}

} // namespace zelfields
