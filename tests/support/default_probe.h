// Decides what ICU and the heap answer while a locale object is made. Linking it into a program
// puts its functions before ICU's and the C library's own.
#pragma once

#include <cstdint>
#include <optional>
#include <unicode/utypes.h>
#if defined(__SANITIZE_ADDRESS__)
#include <sanitizer/lsan_interface.h>
#endif

namespace support {

#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
// A sanitizer brings its own heap, which stays in place.
constexpr bool objectsCanFail = false;
#else
constexpr bool objectsCanFail = true;
#endif

#if defined(__SANITIZE_ADDRESS__)
using MeantLeak = __lsan::ScopedDisabler;
#else
struct MeantLeak {};
#endif

// While it lives, the fields that are set are the answers; the others are asked for as usual. One
// at a time.
struct Answers {
  Answers();
  ~Answers();
  Answers(const Answers &) = delete;
  Answers &operator=(const Answers &) = delete;

  std::optional<const char *> locale = "en_US";   // uloc_getDefault
  std::optional<const char *> codepage = "UTF-8"; // ucnv_getDefaultName
  std::optional<const char *> nextCodepage;       // the same, from its second call on
  UErrorCode ccsidError = U_ZERO_ERROR;           // ucnv_getCCSID
  UErrorCode nameError = U_ZERO_ERROR;            // ucnv_getName
  std::optional<const char *> name;
  bool noObjects = false; // calloc of a locale object's size
};

} // namespace support
