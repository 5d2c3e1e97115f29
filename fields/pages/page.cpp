// Opens and closes code pages, by number or by name.
#include "pages/page.h"

#include "guard.h"
#include "pages/page_traits.h"

#include <charconv>
#include <cstring>
#include <new>

namespace zelfields {

icu::LocalUConverterPointer cloneOf(const UConverter *converter, UErrorCode &error) {
  if (ucnv_getType(converter) == UCNV_COMPOUND_TEXT) { // ICU crashes when it closes a clone of it
    return icu::LocalUConverterPointer(ucnv_open(ucnv_getName(converter, &error), &error));
  }
#if U_ICU_VERSION_MAJOR_NUM >= 71
  return icu::LocalUConverterPointer(ucnv_clone(converter, &error));
#else
  icu::LocalUConverterPointer clone(ucnv_safeClone(converter, nullptr, nullptr, &error));
  error = error == U_SAFECLONE_ALLOCATED_WARNING ? U_ZERO_ERROR : error;
  return clone;
#endif
}

UConverter *restart(icu::LocalUConverterPointer &converter) {
  UConverter *const old = converter.getAlias();
  if (ucnv_getType(old) != UCNV_COMPOUND_TEXT) {
    ucnv_reset(old);
    return old;
  }
  // ICU's reset does nothing to it.
  UErrorCode error = U_ZERO_ERROR;
  icu::LocalUConverterPointer fresh = cloneOf(old, error);
  if (U_FAILURE(error)) {
    throw std::bad_alloc();
  }
  UConverterToUCallback decoding = nullptr;
  UConverterFromUCallback encoding = nullptr;
  const void *context = nullptr;
  ucnv_getToUCallBack(old, &decoding, &context);
  ucnv_setToUCallBack(fresh.getAlias(), decoding, context, nullptr, nullptr, &error);
  ucnv_getFromUCallBack(old, &encoding, &context);
  ucnv_setFromUCallBack(fresh.getAlias(), encoding, context, nullptr, nullptr, &error);
  converter = std::move(fresh);
  return converter.getAlias();
}

namespace {

// Whether a text begins with a byte-order mark: ICU writes one before the first letter.
bool writesSignature(UConverter *converter) {
  const UConverterType type = ucnv_getType(converter);
  if (!isUnicode(type) || hasStates(type)) {
    return false;
  }
  char bytes[16];
  UErrorCode error = U_ZERO_ERROR;
  const int32_t length = ucnv_fromUChars(converter, bytes, sizeof bytes, u"A", 1, &error);
  ucnv_reset(converter);
  int32_t mark = 0;
  return U_SUCCESS(error) && ucnv_detectUnicodeSignature(bytes, length, &mark, &error) != nullptr;
}

int32_t makePage(UConverter *opened, int32_t status, NLS2F_Page **page) {
  icu::LocalUConverterPointer converter(opened);
  if (status > 0) {
    return statusOf(static_cast<UErrorCode>(status));
  }
  const bool marked = writesSignature(opened);
  *page = new NLS2F_Page{std::move(converter), marked, NLS2F_Page::numberUnknown};
  return status;
}

int32_t openByNumber(int32_t number, NLS2F_Page **page) {
  int32_t twoNulls = 0;
  int32_t status = 0;
  UConverter *opened = NLS2_MapCodepageIdToName(number, &twoNulls, &status);
  return makePage(opened, status, page);
}

int32_t openByName(const char *name, NLS2F_Page **page) {
  const char *const end = name + std::strlen(name);
  int32_t number = 0;
  const bool isNumber = *name != '\0' && std::strspn(name, "0123456789") == std::strlen(name);
  if (isNumber) {
    const bool inRange = std::from_chars(name, end, number).ec == std::errc();
    return inRange ? openByNumber(number, page) : U_FILE_ACCESS_ERROR;
  }
  UErrorCode error = U_ZERO_ERROR;
  UConverter *opened = ucnv_open(name, &error);
  return makePage(opened, error, page);
}

} // namespace

} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_OpenPageByName(const char *name, NLS2F_Page **page) {
  if (page != nullptr) {
    *page = nullptr;
  }
  if (name == nullptr || page == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return guarded([&] { return openByName(name, page); });
}

int32_t NLS2F_OpenPageByNumber(int32_t number, NLS2F_Page **page) {
  if (page == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  *page = nullptr;
  return guarded([&] { return openByNumber(number, page); });
}

void NLS2F_ClosePage(NLS2F_Page *page) { delete page; }
