// Decides what ICU and the heap answer while a locale object is made. Linking it into a program
// puts its functions before ICU's and the C library's own.
#pragma once

#include <unicode/utypes.h>
#include <vector>
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

struct Answers {
  const char *locale = "en_US";                 // uloc_getDefault
  std::vector<const char *> codepages{"UTF-8"}; // ucnv_getDefaultName, call by call; the last stays
  UErrorCode ccsidError = U_ZERO_ERROR;         // ucnv_getCCSID, unless zero
  UErrorCode nameError = U_ZERO_ERROR;          // ucnv_getName, unless zero
  bool noName = false;                          // ucnv_getName: null, without an error
  bool noObjects = false;                       // calloc of a locale object's size
};

// While it lives, the answers are these. One at a time.
class Answering {
public:
  explicit Answering(const Answers &answers);
  ~Answering();
  Answering(const Answering &) = delete;
  Answering &operator=(const Answering &) = delete;
};

} // namespace support
