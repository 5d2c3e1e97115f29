// NLS2F_Find: where one text occurs in another.
#include "collate/collator.h"
#include "guard.h"
#include "pages/page_traits.h"

#include <unicode/casemap.h>
#include <unicode/edits.h>
#include <unicode/ustring.h>
#include <vector>

namespace zelfields {
namespace {

UErrorCode lower(const NLS2F_Collator &it, const std::u16string &text, std::u16string &lowered,
                 icu::Edits &edits) {
  return NLS2F_Collator::fill(
      lowered, text.size(), [&](char16_t *units, int32_t room, UErrorCode &error) {
        return icu::CaseMap::toLower(it.locale.c_str(), 0, text.data(),
                                     static_cast<int32_t>(text.size()), units, room, &edits, error);
      });
}

// The place in the text of a place in its lower case; inside what became of one character it is the
// character's beginning or end.
std::size_t sourceOf(const icu::Edits &edits, std::size_t place, bool isEnd) {
  auto edit = edits.getFineIterator();
  UErrorCode error = U_ZERO_ERROR;
  edit.findDestinationIndex(static_cast<int32_t>(place), error); // or the end
  const int32_t inside = static_cast<int32_t>(place) - edit.destinationIndex();
  const int32_t more = !edit.hasChange() ? inside : inside != 0 && isEnd ? edit.oldLength() : 0;
  const int32_t source = edit.sourceIndex() + more;
  return static_cast<std::size_t>(source);
}

// The end of the first `units` units in a page with states, without the shifts after them.
int32_t withoutShifts(NLS2F_Collator &it, const char *text, std::size_t units, int32_t begin,
                      int32_t end) {
  for (int32_t i = begin + 1; i < end; ++i) {
    if (U_SUCCESS(it.decode(text, i, it.text2)) && it.text2.size() == units &&
        it.text2[units - 1] == it.text1[units - 1]) {
      return i;
    }
  }
  return end;
}

// Where text2 occurs in text1, whose bytes are given.
UErrorCode find(NLS2F_Collator &it, const char *text, int64_t length, int64_t &position,
                int64_t &found) {
  const bool ignoresCase = (it.options & IGNORECASE) != 0;
  icu::Edits edits;
  UErrorCode error = ignoresCase ? lower(it, it.text2, it.lower2, edits) : U_ZERO_ERROR;
  error = ignoresCase && U_SUCCESS(error) ? lower(it, it.text1, it.lower1, edits) : error;
  const std::u16string &whole = ignoresCase ? it.lower1 : it.text1;
  const std::u16string &part = ignoresCase ? it.lower2 : it.text2;
  const char16_t *const place = u_strFindFirst(whole.data(), static_cast<int32_t>(whole.size()),
                                               part.data(), static_cast<int32_t>(part.size()));
  if (U_FAILURE(error) || place == nullptr) {
    return error;
  }
  auto first = static_cast<std::size_t>(place - whole.data());
  std::size_t last = first + part.size();
  if (ignoresCase) {
    first = sourceOf(edits, first, false);
    last = sourceOf(edits, last, true);
  }
  std::vector<int32_t> offsets(it.text1.size() + 1, static_cast<int32_t>(length));
  it.text2.resize(it.text1.size() + 1); // a full one would be an overflow if a shift follows
  char16_t *target = it.text2.data();
  const char *source = text;
  ucnv_toUnicode(restart(it.converter), &target, target + it.text2.size(), &source, text + length,
                 offsets.data(), true, &error);
  const bool hasShifts = hasStates(ucnv_getType(restart(it.converter)));
  const int32_t end = offsets[last];
  position = offsets[first];
  found = (hasShifts ? withoutShifts(it, text, last, offsets[first], end) : end) - position;
  return error;
}

} // namespace
} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_Find(NLS2F_Collator *collator, const void *text, int64_t length, const void *pattern,
                   int64_t patternLength, int64_t *position, int64_t *found) {
  if (position == nullptr || found == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  *position = -1;
  *found = 0;
  if (collator == nullptr || !isRange(text, length) || !isRange(pattern, patternLength)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return guarded([&]() -> int32_t {
    NLS2F_Collator &it = *collator;
    UErrorCode error = it.decode(text, length, it.text1);
    error = U_FAILURE(error) ? error : it.decode(pattern, patternLength, it.text2);
    if (U_SUCCESS(error) && it.text2.empty()) {
      *position = 0;
    } else if (U_SUCCESS(error)) {
      error = find(it, static_cast<const char *>(text), length, *position, *found);
    }
    return U_FAILURE(error) ? statusOf(error) : 0;
  });
}
