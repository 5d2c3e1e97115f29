// Watches what the library opens at ICU and gives back, and makes ICU fail. Linking it into a
// program puts its functions before ICU's own; each passes the call on.
#pragma once

#include <dlfcn.h>
#include <unicode/utypes.h>

namespace support {

// Converters open at this moment.
int openConverters();

// While it lives, opens and closes of converters are marked in the open Recording, as
// "+ucnv", "-ucnv".
class ConverterMarks {
public:
  ConverterMarks();
  ~ConverterMarks();
  ConverterMarks(const ConverterMarks &) = delete;
  ConverterMarks &operator=(const ConverterMarks &) = delete;
};

// While it lives, the nth call (from 1) of the named function fails with `error`: one that the
// probe, or another that a test program puts before ICU's.
class FailingConversion {
public:
  FailingConversion(const char *function, int call, UErrorCode error = U_MEMORY_ALLOCATION_ERROR);
  ~FailingConversion();
  FailingConversion(const FailingConversion &) = delete;
  FailingConversion &operator=(const FailingConversion &) = delete;
};

// For the definition of such a function: whether this call is the one that fails. Sets the error.
bool refuse(const char *function, UErrorCode *error);

template <class Function>
Function next(Function /*type*/, const char *name) {
  return reinterpret_cast<Function>(dlsym(RTLD_NEXT, name));
}

} // namespace support

// ICU's function behind the program's own. Its exported name carries ICU's version.
#define TEXT_OF(symbol) #symbol
#define NAME_OF(symbol) TEXT_OF(symbol)
#define NEXT(function) support::next(&(function), NAME_OF(function))

// Puts a function before ICU's that fails on request and is otherwise ICU's; `error` names the
// parameter for the error, `passedOn` calls `original`, `refused` is what a failing call returns.
#define PROBE(Result, function, parameters, passedOn, refused)                                     \
  extern "C" Result function parameters {                                                          \
    static const auto original = NEXT(function);                                                   \
    return support::refuse(#function, error) ? (refused) : (passedOn);                             \
  }
