// How the fields of a kind of page are read: the codes of their characters, one by one.
#pragma once

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>
#include <unicode/utf8.h>

namespace zelfields {

constexpr uint32_t noCode = 0x10000; // what only the path understands
constexpr uint32_t endOfField = 0x10001;

constexpr char shiftOut = 0x0E;
constexpr char shiftIn = 0x0F;

inline uint8_t byteAt(const char *place) { return static_cast<uint8_t>(*place); }

// How many of eight bytes, as they lie in memory, come before the first whose top bit is set.
inline std::ptrdiff_t firstMarked(uint64_t eight) {
  return (std::endian::native == std::endian::little ? std::countr_zero(eight)
                                                     : std::countl_zero(eight)) /
         8;
}

// A source has
//
//   blockWidth    bytes of a code in a block of eight
//   findsEnd      whether its blanks at the end are found from the end
//   codesAreBytes whether only a row can tell that a code is a blank
//   hasLeads      whether a row can tell that a byte begins a character of two
//   longest       bytes that next() may read
//   codesInBlock() how many codes of that width follow, up to eight. Each needs a row nevertheless
//   codeAt()      one of them
//   isNoBlock()   whether none follows
//   next()        the next code, past which it moves; noCode, or endOfField after a last shift
//   last()        the code before `end`, which it moves back; noCode if there is none
//   spell()       the field that holds a code's character alone, at most 4 bytes
//
// `mode` is the source's from character to character: whether they have two bytes.

// Pages in which every byte is a character.
struct SingleByteSource {
  static constexpr std::ptrdiff_t blockWidth = 1;
  static constexpr bool findsEnd = true, codesAreBytes = true, hasLeads = false;
  static constexpr std::ptrdiff_t longest = 1;

  static std::ptrdiff_t codesInBlock(const char *, bool) { return 8; }
  static bool isNoBlock(const char *, bool) { return false; }
  static uint32_t codeAt(const char *block, std::size_t i) { return byteAt(block + i); }
  template <bool isSafe>
  static uint32_t next(const char *&source, const char *, bool &) {
    return byteAt(source++);
  }
  static uint32_t last(const char *, const char *&end) { return byteAt(--end); }
  static std::size_t spell(uint32_t code, char *bytes) {
    bytes[0] = static_cast<char>(code);
    return 1;
  }
};

// Pages with characters of one and two bytes; those of more go the path.
struct MixedSource : SingleByteSource {
  static constexpr bool findsEnd = false, hasLeads = true;
  static constexpr std::ptrdiff_t longest = 2;

  static std::size_t spell(uint32_t code, char *bytes) {
    if (code < 0x100) {
      return SingleByteSource::spell(code, bytes);
    }
    bytes[0] = static_cast<char>(code >> 8);
    bytes[1] = static_cast<char>(code);
    return 2;
  }
};

// EBCDIC with shifts. Those that change nothing, and those with nothing between them, go the path.
struct ShiftedSource : MixedSource {
  static constexpr bool hasLeads = false;
  static constexpr std::ptrdiff_t longest = 3;

  static std::ptrdiff_t codesInBlock(const char *source, bool mode) {
    constexpr uint64_t ones = 0x0101010101010101;
    uint64_t eight = 0;
    std::memcpy(&eight, source, sizeof eight);
    eight ^= ones * shiftOut;
    return mode ? 0 : firstMarked((eight - ones) & ~eight & ones << 7);
  }
  static bool isNoBlock(const char *, bool mode) { return mode; }
  template <bool isSafe>
  static uint32_t next(const char *&source, const char *end, bool &mode) {
    if (!mode) {
      if (*source != shiftOut) {
        return byteAt(source++);
      }
      ++source;
      mode = true;
      return nextPair<isSafe>(source, end);
    }
    if (*source != shiftIn) {
      return nextPair<isSafe>(source, end);
    }
    ++source;
    mode = false;
    return !isSafe && source == end ? endOfField : *source == shiftOut ? noCode : byteAt(source++);
  }
  static std::size_t spell(uint32_t code, char *bytes) {
    if (code < 0x100) {
      return SingleByteSource::spell(code, bytes);
    }
    const char shifted[] = {shiftOut, static_cast<char>(code >> 8), static_cast<char>(code),
                            shiftIn};
    std::memcpy(bytes, shifted, sizeof shifted);
    return sizeof shifted;
  }

private:
  template <bool isSafe>
  static uint32_t nextPair(const char *&source, const char *end) {
    if ((!isSafe && end - source < 2) || byteAt(source) < 0x40) {
      return noCode;
    }
    source += 2;
    return static_cast<uint32_t>(byteAt(source - 2)) << 8 | byteAt(source - 1);
  }
};

// UTF-8 and CESU-8, of the characters up to U+FFFF.
struct Utf8Source {
  static constexpr std::ptrdiff_t blockWidth = 1;
  static constexpr bool findsEnd = true, codesAreBytes = false, hasLeads = false;
  static constexpr std::ptrdiff_t longest = 3;

  static std::ptrdiff_t codesInBlock(const char *source, bool) {
    uint64_t eight = 0;
    std::memcpy(&eight, source, sizeof eight);
    return firstMarked(eight & 0x8080808080808080);
  }
  static bool isNoBlock(const char *source, bool) { return byteAt(source) >= 0x80; }
  static uint32_t codeAt(const char *block, std::size_t i) { return byteAt(block + i); }
  template <bool isSafe>
  static uint32_t next(const char *&source, const char *end, bool &) {
    const uint32_t first = byteAt(source);
    if (first < 0x80) {
      ++source;
      return first;
    }
    if (first >= 0xE0 && first < 0xF0 && (isSafe || end - source >= 3)) {
      const uint32_t second = byteAt(source + 1) ^ 0x80U;
      const uint32_t third = byteAt(source + 2) ^ 0x80U;
      const uint32_t code = (first & 0x0F) << 12 | second << 6 | third;
      source += 3;
      return (second | third) < 0x40 && code >= 0x800 ? code : noCode;
    }
    if (first >= 0xC2 && first < 0xE0 && (isSafe || end - source >= 2)) {
      const uint32_t second = byteAt(source + 1) ^ 0x80U;
      source += 2;
      return second < 0x40 ? (first & 0x1F) << 6 | second : noCode;
    }
    return noCode;
  }
  static uint32_t last(const char *begin, const char *&end) {
    const char *start = end - 1;
    while (start != begin && end - start < 3 && (byteAt(start) & 0xC0) == 0x80) {
      --start;
    }
    const char *after = start;
    bool mode = false;
    const uint32_t code = next<false>(after, end, mode);
    const bool isWhole = after == end;
    end = start;
    return isWhole ? code : noCode;
  }
  static std::size_t spell(uint32_t code, char *bytes) {
    auto *const target = reinterpret_cast<uint8_t *>(bytes);
    std::size_t size = 0;
    U8_APPEND_UNSAFE(target, size, code);
    return size;
  }
};

// UTF-16 and UTF-32 without a signature, of the characters up to U+FFFF.
template <class Unit, bool isBig>
struct UnitSource {
  static constexpr std::ptrdiff_t blockWidth = sizeof(Unit);
  static constexpr bool findsEnd = true, codesAreBytes = false, hasLeads = false;
  static constexpr std::ptrdiff_t longest = sizeof(Unit);

  static std::ptrdiff_t codesInBlock(const char *, bool) { return sizeof(Unit) == 2 ? 8 : 0; }
  static bool isNoBlock(const char *, bool) { return sizeof(Unit) != 2; }
  static uint32_t codeAt(const char *block, std::size_t i) {
    block += i * sizeof(Unit);
    uint32_t code = 0;
    for (std::size_t byte = 0; byte < sizeof(Unit); ++byte) {
      code |= static_cast<uint32_t>(byteAt(block + byte))
              << 8 * (isBig ? sizeof(Unit) - 1 - byte : byte);
    }
    return code;
  }
  template <bool isSafe>
  static uint32_t next(const char *&source, const char *end, bool &) {
    if (!isSafe && end - source < blockWidth) {
      return noCode;
    }
    source += blockWidth;
    return std::min(codeAt(source - blockWidth, 0), noCode);
  }
  static uint32_t last(const char *begin, const char *&end) {
    if ((end - begin) % blockWidth != 0) {
      return noCode;
    }
    end -= blockWidth;
    return std::min(codeAt(end, 0), noCode);
  }
  static std::size_t spell(uint32_t code, char *bytes) {
    for (std::size_t byte = 0; byte < sizeof(Unit); ++byte) {
      bytes[byte] = static_cast<char>(code >> 8 * (isBig ? sizeof(Unit) - 1 - byte : byte));
    }
    return sizeof(Unit);
  }
};

} // namespace zelfields
