// Records with a prefix: two bytes of length and two zero bytes; and blocks of them.
#include "records/reader.h"

namespace zelfields {
namespace {

constexpr std::size_t prefixSize = 4;
constexpr std::size_t leastBlock = 2 * prefixSize;

// Reads the prefix at a place. `length` is that of what it counts, with the prefix.
Found readPrefix(const RecordFormat &format, Piece &piece, std::size_t at, std::size_t least,
                 std::size_t &length) {
  const std::string_view bytes = piece.text.substr(at, prefixSize);
  if (bytes.size() < prefixSize) {
    return !piece.isLast ? Found::more : piece.failed(NLS2F_CUT_SHORT, at, 0, bytes);
  }
  const auto byte = [&](std::size_t i) -> uint32_t { return static_cast<uint8_t>(bytes[i]); };
  if (byte(3) == 0 && byte(2) >= 1 && byte(2) <= 3) {
    return piece.failed(NLS2F_SPANNED, at, 0, bytes);
  }
  length = format.little ? byte(1) << 8 | byte(0) : byte(0) << 8 | byte(1);
  length += format.dataOnly ? prefixSize : 0;
  if (byte(2) != 0 || byte(3) != 0 || length < least) {
    return piece.failed(NLS2F_INVALID_PREFIX, at, 0, bytes);
  }
  return Found::record;
}

bool holds(const RecordFormat &format, Piece piece) {
  int64_t blockEnd = 0;
  Found found = Found::record;
  int count = 0;
  while (count < prefixesForHint &&
         (found = nextPrefixed(format, piece, 0, blockEnd)) == Found::record) {
    ++count;
  }
  return count == prefixesForHint || (count > 0 && found == Found::more && piece.isLast);
}

} // namespace

Found nextPrefixed(const RecordFormat &format, Piece &piece, int64_t total, int64_t &blockEnd) {
  const bool isBlocked = format.kind == RecordFormat::Kind::blocked;
  std::size_t at = piece.at;
  auto end = static_cast<std::size_t>(blockEnd - (isBlocked ? total : 0)); // of the block
  if (at == piece.text.size()) {
    return piece.isLast && isBlocked && at < end ? piece.failed(NLS2F_CUT_SHORT, at) : Found::more;
  }
  std::size_t length = 0;
  if (isBlocked && at == end) {
    if (const Found found = readPrefix(format, piece, at, leastBlock, length);
        found != Found::record) {
      return found;
    }
    end = at + length;
    at += prefixSize;
  }
  if (const Found found = readPrefix(format, piece, at, prefixSize, length);
      found != Found::record) {
    return found;
  }
  if (isBlocked && length > end - at) {
    return piece.failed(NLS2F_INVALID_PREFIX, at, 0, piece.text.substr(at, prefixSize));
  }
  if (length > piece.text.size() - at) {
    return piece.isLast ? piece.failed(NLS2F_CUT_SHORT, at, static_cast<int64_t>(length),
                                       piece.text.substr(at, prefixSize))
                        : Found::more;
  }
  blockEnd = isBlocked ? total + static_cast<int64_t>(end) : 0;
  return piece.found(at + prefixSize, length - prefixSize, at + length);
}

Detail hintFor(const RecordFormat &format, Piece piece) {
  using Kind = RecordFormat::Kind;
  struct Candidate {
    RecordFormat format;
    Detail hint;
  };
  static constexpr Candidate candidates[] = {
      {{.kind = Kind::prefixed}, Detail::tryPrefixed},
      {{.kind = Kind::prefixed, .dataOnly = true}, Detail::tryData},
      {{.kind = Kind::prefixed, .little = true}, Detail::tryLittle},
      {{.kind = Kind::prefixed, .dataOnly = true, .little = true}, Detail::tryDataLittle},
      {{.kind = Kind::blocked}, Detail::tryBlocked}};
  if (holds(format, piece)) {
    return Detail::none;
  }
  for (const Candidate &candidate : candidates) {
    if (holds(candidate.format, piece)) {
      return candidate.hint;
    }
  }
  return Detail::none;
}

} // namespace zelfields
