// byte_table.hpp - a field through a table: for pages in which a byte always becomes the same
// bytes.
#ifndef NLS2_DETAIL_BYTE_TABLE_HPP
#define NLS2_DETAIL_BYTE_TABLE_HPP

#include "nls2/detail/field_path.hpp"

#include <bit>
#include <utility>

namespace nls2::detail {

// One row for each byte of a single-byte page. The rows are what the general path makes of each
// byte, so that the two cannot disagree; whatever fails is left to the general path to explain.
class byte_table {
public:
  // Asks a path whose policy is to replace what is bad and to pad nothing. False when the pair of
  // pages does not allow a table.
  bool build(field_path &path) noexcept {
    if (!is_single_byte(ucnv_getType(path.from())) || !is_stateless(ucnv_getType(path.to()))) {
      return false;
    }
    for (std::size_t byte = 0; byte < rows_.size(); ++byte) {
      if (!learn(path, static_cast<char>(byte))) {
        return false;
      }
    }
    return !depends_on_neighbours(path);
  }

  std::size_t longest() const noexcept { return longest_; }

  void translate(field_path &path, std::span<const char> field, std::span<char> out,
                 field_result &result) const noexcept {
    const bool padded = path.policy().padding != padding::as_is;
    std::size_t text = field.size();
    const std::size_t blanks = padded ? trim(field, text) : 0;
    const std::span<char> room = out.first(path.limit(out));
    std::uint64_t seen = 0;
    const std::size_t written = write(field.first(text), room, seen);
    const std::uint64_t fails = (path.policy().bad == on_bad::stop ? bad : 0) | (padded ? null : 0);
    if (written > room.size() || (seen & fails) != 0) {
      return path.translate(field, out, result); // which says what is wrong
    }
    result.written = written;
    if ((seen & bad) != 0) {
      result.replaced = count_bad(field.first(text));
    }
    if (padded && path.policy().padding != padding::strip) {
      path.add_blanks(blanks, out, result);
      result.replaced = result ? result.replaced : 0;
    }
  }

private:
  // A row: up to four bytes in the low half, as they lie in memory, and above them what the byte is
  // and, on top, their number.
  static constexpr std::size_t most = 4;
  static constexpr unsigned size_shift = 56;
  static constexpr std::uint64_t blank = std::uint64_t{1} << 32;
  static constexpr std::uint64_t null = std::uint64_t{1} << 33;
  static constexpr std::uint64_t bad = std::uint64_t{1} << 34;
  static constexpr std::uint64_t not_one_byte = std::uint64_t{1} << 35;
  static constexpr std::size_t block = 8; // bytes that are tried at once

  std::uint64_t row(char byte) const noexcept { return rows_[static_cast<unsigned char>(byte)]; }
  static std::size_t size_of(std::uint64_t row) noexcept {
    return static_cast<std::size_t>(row >> size_shift);
  }

  bool learn(field_path &path, char byte) noexcept {
    std::array<char, 16> bytes;
    std::array<char16_t, 4> units;
    field_result result;
    path.translate({&byte, 1}, bytes, result);
    UErrorCode error = U_ZERO_ERROR;
    const std::int32_t count =
        ucnv_toUChars(path.from(), units.data(), units.size(), &byte, 1, &error);
    if (!result || result.written > most || failed(error) || count != 1) {
      return false;
    }
    std::array<char, most> low = {};
    std::copy_n(bytes.begin(), result.written, low.begin());
    std::uint32_t packed = 0;
    std::memcpy(&packed, low.data(), most);
    const bool is_null = units[0] == 0;
    const bool is_blank = !is_null && u_isblank(units[0]);
    rows_[static_cast<unsigned char>(byte)] =
        packed | (std::uint64_t{result.written} << size_shift) | (is_blank ? blank : 0) |
        (is_null ? null : 0) | (result.replaced != 0 ? bad : 0) |
        (result.written != 1 ? not_one_byte : 0);
    longest_ = std::max(longest_, result.written);
    return true;
  }

  // A page may have one code for two characters in sequence, such as a letter and an accent.
  bool depends_on_neighbours(field_path &path) const noexcept {
    const UConverterType type = ucnv_getType(path.to());
    if (type != UCNV_SBCS && type != UCNV_MBCS) {
      return false;
    }
    std::array<char, 512> pairs;
    std::array<char, 512 * most> by_table;
    std::array<char, 512 * most + 64> by_icu;
    for (std::size_t first = 0; first < rows_.size(); ++first) {
      for (std::size_t second = 0; second < rows_.size(); ++second) {
        pairs[2 * second] = static_cast<char>(first);
        pairs[2 * second + 1] = static_cast<char>(second);
      }
      std::uint64_t seen = 0;
      const std::size_t written = write(pairs, by_table, seen);
      field_result general;
      path.translate(pairs, by_icu, general);
      if (!general || general.written != written ||
          !std::equal(by_table.begin(), by_table.begin() + static_cast<std::ptrdiff_t>(written),
                      by_icu.begin())) {
        return true;
      }
    }
    return false;
  }

  // Cuts blanks and nulls off the end, a block at a time while all of it is the one or the other.
  std::size_t trim(std::span<const char> field, std::size_t &text) const noexcept {
    std::size_t blanks = 0;
    while (text >= block) {
      const std::uint64_t all =
          common(field.data() + text - block, std::make_index_sequence<block>());
      if ((all & (blank | null)) == 0) {
        break;
      }
      blanks += (all & blank) != 0 ? block : 0;
      text -= block;
    }
    for (; text > 0; --text) {
      const std::uint64_t last = row(field[text - 1]);
      if ((last & (blank | null)) == 0) {
        break;
      }
      blanks += (last & blank) != 0 ? 1 : 0;
    }
    return blanks;
  }

  template <std::size_t... I>
  std::uint64_t common(const char *source, std::index_sequence<I...>) const noexcept {
    return (row(source[I]) & ...);
  }

  std::size_t count_bad(std::span<const char> text) const noexcept {
    return static_cast<std::size_t>(
        std::count_if(text.begin(), text.end(), [&](char byte) { return (row(byte) & bad) != 0; }));
  }

  // Writes the rows of all bytes; more than the room's size when they do not fit. Most text becomes
  // one byte a byte, so that is tried for a block at a time.
  std::size_t write(std::span<const char> text, std::span<char> room,
                    std::uint64_t &seen) const noexcept {
    const char *source = text.data();
    const char *const end = source + text.size();
    char *target = room.data();
    char *const limit = target + room.size();
    std::uint64_t kinds = 0;
    while (static_cast<std::size_t>(end - source) >= block &&
           static_cast<std::size_t>(limit - target) >= block * most) {
      kinds |= write_block(source, target, std::make_index_sequence<block>());
      source += block;
    }
    for (; source != end; ++source) {
      const std::uint64_t next = row(*source);
      if (size_of(next) > static_cast<std::size_t>(limit - target)) {
        return room.size() + 1;
      }
      put(target, next, size_of(next));
      target += size_of(next);
      kinds |= next;
    }
    seen = kinds;
    return static_cast<std::size_t>(target - room.data());
  }

  // Spelt out for each byte, for at lower levels of optimisation compilers leave such loops rolled.
  template <std::size_t... I>
  std::uint64_t write_block(const char *source, char *&target,
                            std::index_sequence<I...>) const noexcept {
    const std::uint64_t rows[] = {row(source[I])...};
    const std::uint64_t together = (rows[I] | ...);
    if ((together & not_one_byte) == 0) {
      ((target[I] = first_byte(rows[I])), ...);
      target += block;
    } else {
      ((put(target, rows[I], most), target += size_of(rows[I])), ...);
    }
    return together;
  }

  static void put(char *target, std::uint64_t row, std::size_t size) noexcept {
    const auto bytes = static_cast<std::uint32_t>(row);
    std::memcpy(target, &bytes, size);
  }
  static char first_byte(std::uint64_t row) noexcept {
    return static_cast<char>(std::endian::native == std::endian::little ? row : row >> 24);
  }

  std::array<std::uint64_t, 256> rows_ = {};
  std::size_t longest_ = 0;
};

} // namespace nls2::detail

#endif
