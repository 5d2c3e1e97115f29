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

// While it lives, the nth call (from 1) of ucnv_convertEx, ucnv_toUChars or ucnv_fromUChars,
// whichever is named, fails with `error`.
class FailingConversion {
public:
  FailingConversion(const char *function, int call, UErrorCode error);
  ~FailingConversion();
  FailingConversion(const FailingConversion &) = delete;
  FailingConversion &operator=(const FailingConversion &) = delete;
};

} // namespace support
