// NLS2F_PageInfo: what a page is like, and which number opens it.
#include "guard.h"
#include "pages/page.h"
#include "pages/page_traits.h"

#include <algorithm>
#include <charconv>
#include <cstring>
#include <string_view>

namespace zelfields {
namespace {

const char *nameOf(const UConverter *converter) {
  UErrorCode error = U_ZERO_ERROR;
  const char *name = ucnv_getName(converter, &error);
  return U_SUCCESS(error) && name != nullptr ? name : "";
}

// Two converters of the same name, options included, have the same table.
bool opens(int32_t number, const char *name) {
  int32_t twoNulls = 0;
  int32_t status = 0;
  const icu::LocalUConverterPointer opened(NLS2_MapCodepageIdToName(number, &twoNulls, &status));
  return status <= 0 && std::strcmp(nameOf(opened.getAlias()), name) == 0;
}

// The number in a name such as "ibm-1140", by which ICU finds a CCSID; 0 in others.
int32_t numberIn(std::string_view alias) {
  int32_t number = 0;
  const char *const end = alias.data() + alias.size();
  if (!alias.starts_with("ibm-") || std::from_chars(alias.data() + 4, end, number).ptr != end) {
    return 0;
  }
  return number;
}

// ICU's CCSID if it opens the page, else the least number that does, else 0.
int32_t findNumber(const UConverter *converter) {
  const char *name = nameOf(converter);
  UErrorCode error = U_ZERO_ERROR;
  if (const int32_t ccsid = ucnv_getCCSID(converter, &error); ccsid != 0 && opens(ccsid, name)) {
    return ccsid;
  }
  int32_t least = INT32_MAX;
  const auto consider = [&](int32_t number) {
    least = number > 0 && number < least && opens(number, name) ? number : least;
  };
  const uint16_t aliases = ucnv_countAliases(name, &error);
  for (uint16_t i = 0; i < aliases && U_SUCCESS(error); ++i) {
    const char *alias = ucnv_getAlias(name, i, &error);
    consider(alias != nullptr ? numberIn(alias) : 0);
  }
  // The numbers that NLS2_MapCodepageIdToName opens by name.
  for (const int32_t number : {874, 932, 936, 949, 950, 1200, 1208}) {
    consider(number);
  }
  for (int32_t number = 57352; number <= 57372; ++number) {
    consider(number);
  }
  return least == INT32_MAX ? 0 : least;
}

int32_t kindOf(UConverterType type) {
  return isSingleByte(type) ? NLS2F_PAGE_SINGLE_BYTE
         : isMixed(type)    ? NLS2F_PAGE_MIXED
         : isUnicode(type)  ? NLS2F_PAGE_UNICODE
                            : NLS2F_PAGE_OTHER;
}

} // namespace
} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_PageInfo(const NLS2F_Page *page, NLS2F_PageFacts *facts) {
  if (page == nullptr || !isWhole(facts)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  const UConverter *converter = page->converter.getAlias();
  const UConverterType type = ucnv_getType(converter);
  // Threads that look for the number at the same time find the same one.
  int32_t number = page->number.load(std::memory_order_relaxed);
  if (number == NLS2F_Page::numberUnknown) {
    number = findNumber(converter);
    page->number.store(number, std::memory_order_relaxed);
  }
  facts->number = number;
  facts->kind = kindOf(type);
  facts->hasStates = hasStates(type) ? 1 : 0;
  facts->hasSignature = page->hasSignature ? 1 : 0;
  const std::string_view name = nameOf(converter);
  const std::size_t length = std::min(name.size(), sizeof facts->name - 1);
  facts->name[name.copy(facts->name, length)] = '\0';
  return 0;
}
