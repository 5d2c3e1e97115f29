// Watches what the library opens at ICU and gives back. Linking it into a program puts its
// functions before ICU's own; each passes the call on.
#pragma once

#include <unicode/utypes.h>

namespace support {

// Converters open at this moment.
int openConverters();
// Converters that were closed since the program began.
int closedConverters();

// While it lives, opens and closes of converters are marked in the open Recording, as
// "+ucnv", "-ucnv".
class ConverterMarks {
public:
  ConverterMarks();
  ~ConverterMarks();
  ConverterMarks(const ConverterMarks &) = delete;
  ConverterMarks &operator=(const ConverterMarks &) = delete;
};

// While it lives, the library's opens of converters fail with `error`, by name or as a CCSID.
class FailingOpens {
public:
  explicit FailingOpens(UErrorCode error);
  ~FailingOpens();
  FailingOpens(const FailingOpens &) = delete;
  FailingOpens &operator=(const FailingOpens &) = delete;
};

// While it lives, the nth call (from 1) of the named function fails with `error`: ucnv_open,
// ucnv_convertEx, ucnv_toUChars, ucnv_fromUChars, or another that a test program puts before ICU's.
class FailingConversion {
public:
  FailingConversion(const char *function, int call, UErrorCode error);
  ~FailingConversion();
  FailingConversion(const FailingConversion &) = delete;
  FailingConversion &operator=(const FailingConversion &) = delete;
};

// For the definition of such a function: whether this call is the one that fails. Sets the error.
bool refuse(const char *function, UErrorCode *error);

} // namespace support
