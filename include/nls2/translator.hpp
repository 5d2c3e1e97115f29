// translator.hpp - fields, columns and long texts from one code page to another.
//
//   nls2::translator to_utf8(nls2::code_page("ibm-37"), nls2::code_page("utf-8"),
//                            {.padding = nls2::padding::strip});
//   std::string line;
//   if (const nls2::field_result result = to_utf8.translate(field, line); !result) {
//     std::cerr << to_utf8.describe(result.problem) << '\n';
//   }
#ifndef NLS2_TRANSLATOR_HPP
#define NLS2_TRANSLATOR_HPP

#include "nls2/bytes.hpp"
#include "nls2/code_page.hpp"
#include "nls2/detail/common.hpp"
#include "nls2/error.hpp"

#include <compare>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <system_error>
#include <utility>

namespace nls2 {
inline namespace NLS2_MODE {

// What becomes of the blanks at a field's end. Blanks are u_isblank characters (tabs and all space
// separators). Except with as_is, trailing blanks and nulls are removed first; what remains is the
// text, and a null inside it is a problem.
enum class padding : std::int32_t {
  as_is = NLS2F_AS_IS, // the field as it is, blanks and nulls too
  strip = NLS2F_STRIP, // the text alone
  fill = NLS2F_FILL,   // the text and U+0020 up to exactly `width` bytes
  // The text and one U+0020 for each blank, as many as fit in `width`.
  keep_blanks = NLS2F_KEEP_BLANKS
};

// What to do with bytes that are not valid in the source page, and with characters that the
// destination page lacks.
enum class on_bad : std::int32_t {
  stop = NLS2F_STOP, // the field fails
  // U+FFFD or the page's substitution character takes their place; characters that are ignorable by
  // default (U+00AD, U+200B ...) disappear, as ICU does it. All are counted.
  replace = NLS2F_REPLACE,
  // The same, but ignorable characters are substituted, too.
  replace_visibly = NLS2F_REPLACE_VISIBLY
};

// How a translator treats fields.
struct field_policy {
  nls2::padding padding = nls2::padding::as_is;
  std::size_t width = 0; // bytes: the exact size with fill, otherwise the maximum; 0: no limit
  on_bad bad = on_bad::stop;
};

enum class problem_kind : std::int32_t {
  none = 0,
  invalid_bytes = NLS2F_INVALID_BYTES, // bytes that are not valid in the source page
  not_in_page = NLS2F_NOT_IN_PAGE,     // a character that the destination page lacks
  no_room = NLS2F_NO_ROOM,             // the output takes more than its room, or than `width`
  embedded_null = NLS2F_EMBEDDED_NULL, // a null inside the text of a padded field
  no_exact_fill = NLS2F_NO_EXACT_FILL, // no number of blanks makes the field `width` bytes long
  too_long = NLS2F_TOO_LONG            // the field has more than 2,147,483,647 bytes
};

// What is wrong with a text, and where (NLS2F_Problem).
class problem {
public:
  [[nodiscard]] problem_kind kind() const noexcept { return problem_kind{found_.kind}; }
  // The row of a column, from 0; else 0.
  [[nodiscard]] std::size_t record() const noexcept { return at(found_.record); }
  // In the field or text: the first byte of the bad sequence or of the character that is lacking or
  // does not fit.
  [[nodiscard]] std::size_t offset() const noexcept { return at(found_.offset); }
  // no_room: the smallest room with which the same call succeeds, unless that is more than `width`;
  // no_exact_fill: the next shorter width that can be filled; otherwise 0.
  [[nodiscard]] std::size_t needed() const noexcept { return at(found_.needed); }
  // Of not_in_page and of a character that does not fit; otherwise 0.
  [[nodiscard]] char32_t code_point() const noexcept { return found_.codePoint; }
  // Up to eight source bytes at offset().
  [[nodiscard]] std::string_view bytes() const &noexcept {
    return {reinterpret_cast<const char *>(found_.bytes), at(found_.byteCount)};
  }
  std::string_view bytes() const && = delete;

  [[nodiscard]] NLS2F_Problem *get() noexcept { return &found_; }
  [[nodiscard]] const NLS2F_Problem *get() const noexcept { return &found_; }

private:
  static std::size_t at(std::int64_t value) noexcept { return static_cast<std::size_t>(value); }

  NLS2F_Problem found_{sizeof(NLS2F_Problem), 0, 0, 0, 0, 0, 0, {}};
};

// The result of a field. If the status is NLS2F_ERR_FIELD (40), `problem` is what is wrong; others
// are 32 (no memory) and 37 (an empty translator, or an argument that is not valid).
struct [[nodiscard]] field_result {
  std::int32_t status = 0;
  std::size_t written = 0;  // bytes of the output; 0 on failure
  std::size_t replaced = 0; // invalid sequences, and characters that the destination page lacks
  nls2::problem problem;

  explicit operator bool() const noexcept { return status <= 0; }
  // The status; instead of 40 that of the kind of problem, if there is one: 10, 12, 15 or 31.
  [[nodiscard]] std::error_code error() const noexcept {
    switch (status == NLS2F_ERR_FIELD ? problem.kind() : problem_kind::none) {
    case problem_kind::invalid_bytes:
      return make_status(U_ILLEGAL_CHAR_FOUND);
    case problem_kind::not_in_page:
      return make_status(U_INVALID_CHAR_FOUND);
    case problem_kind::no_room:
      return make_status(U_BUFFER_OVERFLOW_ERROR);
    case problem_kind::too_long:
      return make_status(detail::too_long);
    default:
      return make_status(status);
    }
  }
};

// The result of a piece of a text.
struct [[nodiscard]] chunk_result : field_result {
  std::size_t read = 0; // bytes of the piece that were used: all on success
};

// One field of many records.
struct column {
  byte_view fields;       // from the first byte of the first field to the last byte of the last
  std::size_t length = 0; // bytes of each field
  std::size_t stride = 0; // bytes from one field to the next: the records' length
};

// The result of a column. `written` counts the bytes of the rows done, on failure too. With
// `good` and a status of 0, `problem` is that of the first row that failed, if any did.
struct [[nodiscard]] column_result : field_result {
  std::size_t done = 0;   // rows whose bytes, offsets and bits are final
  std::size_t failed = 0; // of these, rows with a problem
};

namespace detail {
inline void close_translator(NLS2F_Translator *owned) noexcept { NLS2F_CloseTranslator(owned); }
} // namespace detail

// Translates texts from one code page to another, and stays open for the next. For one thread at a
// time; a copy costs little and serves another thread. The functions of an empty one fail with 37
// (invalid_argument).
class translator : public detail::owner<NLS2F_Translator, detail::close_translator> {
public:
  using owner::owner;

  // Empty on failure. Errors: 36 (invalid_argument) for fill without a width, a width of more than
  // 2,147,483,647 bytes, and fill into a page that lacks U+0020; 37 (invalid_argument) for an empty
  // page; 32 (no_memory); ICU's.
  translator(const code_page &from, const code_page &to, const field_policy &policy NLS2_MAY_OMIT,
             error_ref error NLS2_MAY_OMIT) {
    const NLS2F_Policy c{sizeof(NLS2F_Policy), static_cast<std::int32_t>(policy.padding),
                         static_cast<std::int32_t>(policy.bad), 0, detail::to_int64(policy.width)};
    NLS2F_Translator *opened = nullptr;
    const std::int32_t status = NLS2F_OpenTranslator(from.get(), to.get(), &c, &opened);
    reset(opened);
    if (status > 0) {
      std::error_code ignored;
      const std::string pages = from.facts(ignored).name + " to " + to.facts(ignored).name;
      error.report(status, "cannot open a translator from", pages);
    }
  }

  // A copy has learned what the other one has, and is at the beginning of a text. Empty on failure.
  // Errors: 32 (no_memory); 37 (invalid_argument) for a copy of an empty one. Without exceptions
  // this is the only way to copy.
  // NOLINTNEXTLINE(readability-redundant-member-init): GCC warns without it
  translator(const translator &other, error_ref error NLS2_MAY_OMIT) : owner() {
    NLS2F_Translator *opened = nullptr;
    const std::int32_t status = NLS2F_CloneTranslator(other.get(), &opened);
    reset(opened);
    error.report(status, "cannot copy a translator");
  }
  translator(translator &&) noexcept = default;
  translator &operator=(translator &&) noexcept = default;
#if NLS2_HAS_EXCEPTIONS
  translator &operator=(const translator &other) { return *this = translator(other); }
#endif

  // Bytes of output that are enough for any field of this length; 0 if the translator is empty.
  [[nodiscard]] std::size_t max_size(std::size_t length) const noexcept {
    std::int64_t size = 0;
    NLS2F_MaxSize(get(), detail::to_int64(length), &size);
    constexpr std::int64_t most = PTRDIFF_MAX;
    return static_cast<std::size_t>(size < most ? size : most);
  }

  // Translates a field into `out`. result.written is the number of bytes written; the rest of
  // `out`, and all of it on failure, is unspecified. The two must not overlap. Does not allocate
  // for fields of up to 2,048 bytes, nor for longer ones once it has met one as long.
  field_result translate(byte_view field, byte_room out) noexcept {
    field_result result;
    std::int64_t written = 0;
    std::int64_t replaced = 0;
    result.status =
        NLS2F_Translate(get(), field.data(), detail::to_int64(field.size()), out.data(),
                        detail::to_int64(out.size()), &written, &replaced, result.problem.get());
    result.written = static_cast<std::size_t>(written);
    result.replaced = static_cast<std::size_t>(replaced);
    return result;
  }

  // Translates a field and appends it to `out`, which is unchanged on failure. A field inside `out`
  // is refused (37, invalid_argument).
  field_result translate(byte_view field, std::string &out) {
    const std::size_t before = out.size();
    const std::size_t room = field.size() <= detail::max_length ? max_size(field.size()) : 0;
    field_result result;
    if (holds(out, field) || room > out.max_size() - before) {
      result.status = holds(out, field) ? NLS2_ERR_INVALID_PARAMETER : NLS2_ERR_NO_MEMORY;
      return result;
    }
    out.resize(before + room);
    result = translate(field, byte_room(out.data() + before, room));
    out.resize(before + result.written);
    return result;
  }

  // The translation as a new string; empty on failure. Errors: those of field_result::error(). The
  // exception describes the problem.
  [[nodiscard]] std::string translate(byte_view field, error_ref error NLS2_MAY_OMIT) {
    std::string out;
    const field_result result = translate(field, out);
    report(result, error);
    return out;
  }

  // Translates a field of many records: row i is the bytes of `out` from offsets[i] to before
  // offsets[i + 1]. There are offsets.size() - 1 rows.
  //
  // `good` has a bit for each row, bit i % 8 of byte i / 8: 1 if the row is good. Then a row with a
  // problem becomes empty, and result.problem describes the first. Without `good` such a row stops
  // the call. A row that does not fit in `out` or in a 32-bit offset always stops it (no_room). The
  // rows before it are done: go on there with new buffers.
  //
  // Status 37 (invalid_argument) if the fields, or the bits, are fewer than the rows.
  column_result translate(const column &source, byte_room out, std::span<std::int32_t> offsets,
                          std::span<std::uint8_t> good = {}) noexcept {
    return translate_rows(source, out, offsets, good);
  }
  column_result translate(const column &source, byte_room out, std::span<std::int64_t> offsets,
                          std::span<std::uint8_t> good = {}) noexcept {
    return translate_rows(source, out, offsets, good);
  }

  // Translates a text piece by piece: wherever it is cut, the pieces' outputs together are the
  // translation of the whole. The end of a piece may be kept back until the next one. `last` ends
  // the text; the next piece begins a new one. Only with padding::as_is and no width (36,
  // invalid_argument).
  //
  // no_room is not an end: result.read and result.written are right, so write what there is and
  // call again with the rest of the piece, even if that is empty. 32 bytes of room are enough to go
  // on. Any other problem ends the text; its offset() counts from the text's beginning.
  chunk_result translate_chunk(byte_view piece, bool last, byte_room out) noexcept {
    chunk_result result;
    std::int64_t read = 0;
    std::int64_t written = 0;
    std::int64_t replaced = 0;
    result.status = NLS2F_TranslateChunk(get(), piece.data(), detail::to_int64(piece.size()),
                                         last ? 1 : 0, out.data(), detail::to_int64(out.size()),
                                         &read, &written, &replaced, result.problem.get());
    result.read = static_cast<std::size_t>(read);
    result.written = static_cast<std::size_t>(written);
    result.replaced = static_cast<std::size_t>(replaced);
    return result;
  }

  // A problem that this translator found, in English: "the character U+20AC is not in
  // ibm-37_P100-1995".
  [[nodiscard]] std::string describe(const problem &found) const {
    char text[256] = "";
    NLS2F_DescribeProblem(get(), found.get(), text, sizeof text);
    return text;
  }

  // Reports a result as other functions report errors. True if it is a success.
  bool report(const field_result &result, error_ref error NLS2_MAY_OMIT) const {
    if (result.status != NLS2F_ERR_FIELD) {
      return error.report(result.status, "cannot translate the text");
    }
    const std::string place = "offset " + std::to_string(result.problem.offset()) + ": ";
    return error.report(result.error(), place + describe(result.problem));
  }

private:
  static bool holds(const std::string &out, byte_view field) noexcept {
    const void *begin = out.data();
    const void *end = out.data() + out.capacity();
    constexpr std::compare_three_way compare;
    return field.size() != 0 && compare(field.data(), begin) >= 0 && compare(field.data(), end) < 0;
  }

  template <class Offset>
  column_result translate_rows(const column &source, byte_room out, std::span<Offset> offsets,
                               std::span<std::uint8_t> good) noexcept {
    column_result result;
    const std::size_t rows = offsets.empty() ? 0 : offsets.size() - 1;
    const std::size_t size = source.fields.size();
    const bool fields_are_there =
        rows == 0 || (source.length <= size &&
                      (source.stride == 0 || rows - 1 <= (size - source.length) / source.stride));
    if (offsets.empty() || !fields_are_there || (!good.empty() && good.size() < (rows + 7) / 8)) {
      result.status = NLS2_ERR_INVALID_PARAMETER;
      return result;
    }
    NLS2F_Column c{};
    c.size = sizeof c;
    c.offsetBits = 8 * sizeof(Offset);
    c.fields = source.fields.data();
    c.length = detail::to_int64(source.length);
    c.stride = detail::to_int64(source.stride);
    c.rows = detail::to_int64(rows);
    c.out = out.data();
    c.room = detail::to_int64(out.size());
    c.offsets = offsets.data();
    c.good = good.empty() ? nullptr : good.data();
    result.status = NLS2F_TranslateColumn(get(), &c, result.problem.get());
    result.done = static_cast<std::size_t>(c.done);
    result.failed = static_cast<std::size_t>(c.failed);
    result.replaced = static_cast<std::size_t>(c.replaced);
    result.written = result.done > 0 ? static_cast<std::size_t>(offsets[result.done]) : 0;
    return result;
  }
};

} // namespace NLS2_MODE
} // namespace nls2

#endif
