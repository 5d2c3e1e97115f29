// The blanks after a text: their bytes, and how many of them a policy calls for.
#pragma once

#include "nls2_fields.h"
#include "translate/encoder.h"

#include <array>
#include <cstdint>
#include <unicode/localpointer.h>

namespace zelfields {

struct Replacements;

// What a text takes with no blank after it, with one, two and three. From two on each takes as much
// as the one before.
struct Sizes {
  std::array<int64_t, 4> with;

  int64_t each() const { return with[3] - with[2]; }
  int64_t of(int64_t blanks) const {
    return blanks < 3 ? with[static_cast<std::size_t>(blanks)] : with[2] + (blanks - 2) * each();
  }
};

class Blanks {
public:
  static constexpr int64_t cannot = -1;

  // Learns what the destination's blank is from a converter with the policy's callbacks.
  void learn(icu::LocalUConverterPointer &to, const Replacements &replaced);

  bool isLacking() const { return size_ == 0; }   // and the policy stops
  bool isReplaced() const { return isReplaced_; } // since the page lacks it
  int64_t size() const { return size_; }
  // Whether the bytes of text and blanks differ from the text's and the blanks'.
  bool dependOn(std::u16string_view text) const;

  // The sizes of a text of `size` bytes, if the blanks do not depend on it.
  Sizes after(int64_t size) const {
    return {{size, size + size_, size + 2 * size_, size + 3 * size_}};
  }
  // How many blanks follow a text that lost `cut` of them, if the text alone fits in the width;
  // `cannot` if no number fills it.
  static int64_t count(const NLS2F_Policy &policy, const Sizes &sizes, int64_t cut);
  // The longest size below the width that blanks can fill.
  static int64_t nextShorter(const NLS2F_Policy &policy, const Sizes &sizes);

  void put(char *target, int64_t count) const;

private:
  std::array<char, 8> bytes_ = {}; // as they are written after other text
  int64_t size_ = 0;
  bool isReplaced_ = false;
  bool dependOnText_ = false;
  bool firstBringsMore_ = false; // a signature or a header
};

} // namespace zelfields
