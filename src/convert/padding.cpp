// The padding path of NLS2_TranslateString: fields with their trailing blanks kept, filled or cut.

#include "convert/padding.h"

#include "codepage/utf16_text.h"
#include "trace/memory.h"
#include "trace/status.h"

#include <algorithm>
#include <cstring>
#include <unicode/uchar.h>
#include <unicode/ustring.h>

namespace nls2::convert {

namespace {

constexpr UChar fillCharacter = 0x0020;

// The source as UTF-16 and what the steps find out about it.
struct Field {
  nls2::trace::Block<UChar> units; // ends in a zero unit
  int32_t sourceLength = 0;        // units of the whole source
  int32_t textLength = 0;          // units up to the first null, trailing blanks cut off
  int32_t trailingBlanks = 0;
  int32_t room = 0; // bytes of the destination without the terminator
};

bool isFailedPreflight(UErrorCode status) {
  return failed(status) && status != U_BUFFER_OVERFLOW_ERROR;
}

// ICU takes -1 for a null-terminated text and refuses every other negative length.
int32_t lengthForIcu(const PaddedTranslation &call) { return std::max(call.buffers.sourceLen, -1); }

bool measureSource(const PaddedTranslation &call, Field &field) {
  UErrorCode status = U_ZERO_ERROR;
  field.sourceLength = ucnv_toUChars(call.sourceConverter.getAlias(), nullptr, 0,
                                     call.buffers.source, lengthForIcu(call), &status);
  if (isFailedPreflight(status)) {
    NLS2_TRACE(call.trace, "Error pre-flighting source to UChars %d", status);
    return call.fail(status);
  }
  return true;
}

// As many units as the source has units or the destination has bytes, whichever is more, and a zero
// unit.
bool allocateUnits(const PaddedTranslation &call, Field &field) {
  NLS2_TRACE(call.trace, "Allocate memory to hold entire utf16 string.");
  const auto units = static_cast<uint64_t>(std::max(call.buffers.destLen, field.sourceLength)) + 1;
  field.units = nls2::trace::allocate<UChar>(call.trace, units * sizeof(UChar));
  if (!field.units) {
    NLS2_TRACE(call.trace, "Could not allocate memory.");
    return call.fail(NLS2_ERR_NO_MEMORY);
  }
  std::memset(field.units.get(), 0, units * sizeof(UChar));
  return true;
}

bool convertSource(const PaddedTranslation &call, Field &field) {
  NLS2_TRACE(call.trace, "Convert source to UChars.");
  UErrorCode status = U_ZERO_ERROR;
  ucnv_toUChars(call.sourceConverter.getAlias(), field.units.get(), field.sourceLength,
                call.buffers.source, lengthForIcu(call), &status);
  if (failed(status)) {
    NLS2_TRACE(call.trace, "Error converting source to UChars %d.", status);
    return call.fail(status);
  }
  return true;
}

// Clears the blanks and nulls at the end; nulls among them are not counted as blanks. The
// first null that is left ends the text.
void trim(const PaddedTranslation &call, Field &field) {
  UChar *units = field.units.get();
  codepage::clearTrailing(units, field.sourceLength, [&field](UChar32 character) {
    const bool blank = u_isblank(character);
    field.trailingBlanks += blank ? 1 : 0;
    return blank || character == 0;
  });
  NLS2_TRACE(call.trace, "There were %d trailing blanks in source string.", field.trailingBlanks);
  field.textLength = u_strlen(units);
  NLS2_TRACE(call.trace, "Resulting non-space filled string length is %d.", field.textLength);
}

// The text must fit together with the terminator, whatever the options.
bool fitText(const PaddedTranslation &call, Field &field) {
  UErrorCode status = U_ZERO_ERROR;
  const int32_t needed = ucnv_fromUChars(call.destConverter.getAlias(), nullptr, 0,
                                         field.units.get(), field.textLength, &status);
  if (isFailedPreflight(status)) {
    NLS2_TRACE(call.trace, "Error pre-flighting temp buffer to destination cp %d.", status);
    return call.fail(status);
  }
  field.room =
      call.buffers.destLen - (call.has(NLS2_STRING_TERMINATE) ? call.terminatorLength() : 0);
  if (needed > field.room) {
    NLS2_TRACE(call.trace, "Destination buffer must be at least %d bytes in length.", needed);
    return call.fail(U_BUFFER_OVERFLOW_ERROR);
  }
  return true;
}

// Writes the first `length` units into the destination. Returns the bytes that they take.
int32_t writeUnits(const PaddedTranslation &call, const Field &field, int32_t length,
                   UErrorCode &status) {
  status = U_ZERO_ERROR;
  return ucnv_fromUChars(call.destConverter.getAlias(), call.buffers.dest, field.room,
                         field.units.get(), length, &status);
}

void release(PaddedTranslation &call, Field &field) {
  field.units.reset();
  call.closeConverters();
}

int32_t finish(const PaddedTranslation &call, const Field &field, int32_t amountWritten) {
  NLS2_TRACE(call.trace, "Output parameters. destLen %d,amountWritten %d", field.room,
             amountWritten);
  call.trace.dump(call.buffers.dest,
                  static_cast<uint32_t>(std::min(amountWritten, call.buffers.destLen)));
  return amountWritten;
}

// The count is of units, not bytes, and may therefore be more than was written.
int32_t writeStripped(PaddedTranslation &call, Field &field) {
  NLS2_TRACE(call.trace,
             "STRIP TRAILING option is specified, convert string to destination codepage.");
  UErrorCode status = U_ZERO_ERROR;
  writeUnits(call, field, field.textLength, status);
  release(call, field);
  if (failed(status)) {
    NLS2_TRACE(call.trace, "Error converting to destination %d.", status);
    return call.fail(status);
  }
  const int32_t terminator = call.has(NLS2_STRING_TERMINATE) ? call.terminatorLength() : 0;
  return finish(call, field, field.textLength + terminator);
}

// Leaks the buffer and both converters: the library always did, and callers that count leaks expect
// it. Only TERMINATE with unknown bits leads here, a bug in the caller.
int32_t refuseOptionAndLeak(PaddedTranslation &call, Field &field) {
  NLS2_TRACE(call.trace, "Invalid option specified.");
  static_cast<void>(field.units.release());
  call.sourceConverter.orphan();
  call.destConverter.orphan();
  return call.fail(NLS2_ERR_INVALID_OPTION);
}

// How many units the padded field has. It is compared with the room, a count of bytes: exact for a
// page in which every unit of the field takes one byte.
int32_t paddedLength(const PaddedTranslation &call, const Field &field) {
  NLS2_TRACE(call.trace, "Option is string file and or strip trailing.");
  int32_t paddedUnits = 0;
  if (call.has(NLS2_STRING_TRAILING)) {
    NLS2_TRACE(call.trace, "NLS2_STRING_TRAILING set.");
    paddedUnits = std::min(field.textLength + field.trailingBlanks, field.room);
    NLS2_TRACE(call.trace, "maximumBufferLength is adjusted to %d.", paddedUnits);
  }
  if (call.has(NLS2_STRING_FILL)) {
    NLS2_TRACE(call.trace, "NLS2_STRING_FILL set.");
    paddedUnits = field.room;
    NLS2_TRACE(call.trace, "maximumBufferLength is adjusted to %d.", paddedUnits);
  }
  return paddedUnits;
}

void appendBlanks(Field &field, int32_t paddedUnits) {
  for (int32_t i = field.textLength; i < paddedUnits; ++i) {
    field.units[static_cast<std::size_t>(i)] = fillCharacter;
  }
}

// If units of the text take several bytes, the blanks may not all fit. Then retries once with one
// unit fewer for each byte too many, which is exact if a blank is one byte.
bool writePadded(const PaddedTranslation &call, const Field &field, int32_t paddedUnits) {
  UErrorCode status = U_ZERO_ERROR;
  const int32_t written = writeUnits(call, field, paddedUnits, status);
  if (status == U_BUFFER_OVERFLOW_ERROR) {
    NLS2_TRACE(call.trace, "Overflowed buffer because of blanks, possible problem.");
    const int32_t excess = written - field.room;
    NLS2_TRACE(call.trace, "Reduce amount to convert by %d.characters to fit", excess);
    writeUnits(call, field, paddedUnits - excess, status);
  }
  if (failed(status)) {
    NLS2_TRACE(call.trace, "Error converting from UChars to destination codepage %d.", status);
    return call.fail(status);
  }
  return true;
}

int32_t writeField(PaddedTranslation &call, Field &field) {
  const int32_t paddedUnits = paddedLength(call, field);
  appendBlanks(field, paddedUnits);
  if (!writePadded(call, field, paddedUnits)) {
    return 0;
  }
  release(call, field);
  int32_t amountWritten = field.room;
  if (call.has(NLS2_STRING_TERMINATE)) {
    for (int32_t i = 0; i < call.terminatorLength(); ++i) {
      call.buffers.dest[amountWritten++] = 0;
    }
  }
  return finish(call, field, amountWritten);
}

} // namespace

int32_t translateWithPadding(PaddedTranslation &call) {
  NLS2_TRACE(call.trace, "Converting with options %X.", call.options);
  Field field;
  if (!measureSource(call, field) || !allocateUnits(call, field) || !convertSource(call, field)) {
    return 0;
  }
  trim(call, field);
  if (!fitText(call, field)) {
    return 0;
  }
  if (call.has(NLS2_STRING_STRIP_TRAILING)) {
    return writeStripped(call, field);
  }
  if (call.has(NLS2_STRING_FILL | NLS2_STRING_TRAILING)) {
    return writeField(call, field);
  }
  return refuseOptionAndLeak(call, field);
}

} // namespace nls2::convert
