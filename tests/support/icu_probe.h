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

} // namespace support
