// What must be known of a code page beyond its tables, by the type of ICU's converter.
#pragma once

#include <algorithm>
#include <initializer_list>
#include <unicode/ucnv.h>

namespace zelfields {

inline bool isOneOf(UConverterType type, std::initializer_list<UConverterType> types) noexcept {
  return std::find(types.begin(), types.end(), type) != types.end();
}

// Every byte is a character.
inline bool isSingleByte(UConverterType type) noexcept {
  return isOneOf(type, {UCNV_SBCS, UCNV_LATIN_1, UCNV_US_ASCII});
}

inline bool isMixed(UConverterType type) noexcept {
  return isOneOf(type, {UCNV_MBCS, UCNV_EBCDIC_STATEFUL, UCNV_DBCS});
}

inline bool isLmbcs(UConverterType type) noexcept {
  return type >= UCNV_LMBCS_1 && type <= UCNV_LMBCS_LAST;
}

// Pages that hold all of Unicode.
inline bool isUnicode(UConverterType type) noexcept {
  return isOneOf(type,
                 {UCNV_UTF8, UCNV_CESU8, UCNV_UTF16, UCNV_UTF16_BigEndian, UCNV_UTF16_LittleEndian,
                  UCNV_UTF32, UCNV_UTF32_BigEndian, UCNV_UTF32_LittleEndian, UCNV_UTF7,
                  UCNV_IMAP_MAILBOX, UCNV_SCSU, UCNV_BOCU1});
}

// What a byte means depends on those before it.
inline bool hasStates(UConverterType type) noexcept {
  return isOneOf(type, {UCNV_EBCDIC_STATEFUL, UCNV_UTF7, UCNV_IMAP_MAILBOX, UCNV_SCSU, UCNV_BOCU1,
                        UCNV_ISO_2022, UCNV_HZ, UCNV_ISCII, UCNV_COMPOUND_TEXT});
}

// Without a signature: a character is the same bytes wherever it is.
inline bool isStateless(UConverterType type) noexcept {
  return isSingleByte(type) ||
         isOneOf(type, {UCNV_MBCS, UCNV_DBCS, UCNV_UTF8, UCNV_CESU8, UCNV_UTF16_BigEndian,
                        UCNV_UTF16_LittleEndian, UCNV_UTF32_BigEndian, UCNV_UTF32_LittleEndian});
}

// Text may leave a mode open that a blank after it closes, or that makes the blank another.
inline bool leavesModesOpen(UConverterType type) noexcept {
  return isLmbcs(type) || isOneOf(type, {UCNV_UTF7, UCNV_IMAP_MAILBOX, UCNV_SCSU, UCNV_ISCII,
                                         UCNV_ISO_2022, UCNV_HZ, UCNV_COMPOUND_TEXT});
}

// ICU's decoder keeps back bytes or a character, and does not count them as pending.
inline bool keepsBack(UConverterType type) noexcept { return isOneOf(type, {UCNV_ISCII, UCNV_HZ}); }

// ICU's converter forgets half a pair at the end of a text that ends in a call of its own.
inline bool losesHalves(UConverterType type) noexcept {
  return isOneOf(type, {UCNV_HZ, UCNV_COMPOUND_TEXT});
}

// What a character becomes depends on those after it in the same call.
inline bool looksAhead(UConverterType type) noexcept { return type == UCNV_SCSU || isLmbcs(type); }

// How many UTF-16 units a byte can become: a supplementary character, or a sequence.
inline int64_t unitsPerByte(UConverterType type) noexcept {
  return isOneOf(type, {UCNV_SCSU, UCNV_BOCU1, UCNV_ISCII, UCNV_SBCS}) ? 2 : 1;
}

} // namespace zelfields
