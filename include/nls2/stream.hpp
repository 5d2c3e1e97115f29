// stream.hpp - files of text in any encoding, read and written as UTF-16.
//
// Not part of nls2.hpp: programs that include it call ICU and must be rebuilt when ICU changes.
#ifndef NLS2_STREAM_HPP
#define NLS2_STREAM_HPP

#include "nls2/detail/common.hpp"
#include "nls2/error.hpp"
#include "nls2/locale.hpp"
#include "nls2/translator.hpp"

#include <cerrno>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <unicode/ucnv.h>
#include <unicode/ucnv_cb.h>
#include <unicode/ustdio.h>
#include <utility>

namespace nls2 {
inline namespace NLS2_MODE {

// Owns one of ICU's file streams (<unicode/ustdio.h>). Move-only; may be empty.
//
// Bytes that do not convert are read as U+FFFD or U+001A, and characters that the encoding lacks
// are written as its substitution character. With on_bad::stop a call that meets them reports that
// afterwards (invalid_text). ICU reads ahead, and converts a lone surrogate with what follows, so
// the report may come one call early or late.
//
// Errors of the functions below:
//
//   12  invalid_text, as above
//   31  too_long: more than 2,147,483,647 units
//   37  invalid_argument: the stream is empty
//   38  invalid_locale: the locale that it was opened with is no longer live
//   errno, in std::generic_category(): the system cannot read or write the file. Any later call
//   reports it again (std::errc::io_error) until rewind()
class stream {
public:
  stream() noexcept = default;

  // Opens a file. No stream uses the language or the code page of its locale; but every call checks
  // that the locale is still live.
  //
  //   path      passed to the system as it is
  //   mode      as for fopen: "r", "w", "a", with "+" to write and read
  //   encoding  a converter name of ICU's, such as "UTF-8" or "ibm-1141"
  //
  // Empty on failure. Errors: 38 (invalid_locale); 4 (unknown_code_page) for an encoding that ICU
  // does not know, and then the file is unchanged; 37 (invalid_argument) for an empty argument, and
  // for one with a null inside; 31 (too_long) for a path of 4,096 bytes, an encoding of 256 or a
  // mode of 8; errno in std::generic_category() if the system does not open the file.
  //
  // Surprises: a directory opens for reading, and the first read fails, so check the path first.
  // "UTF-16" writes a byte-order mark and reads with or without one (then big-endian); "UTF-16LE",
  // "UTF-16BE" and "UTF-8" write none, and read one as the unit U+FEFF.
  stream(const locale &where, std::string_view path, std::string_view mode,
         std::string_view encoding, on_bad bad NLS2_MAY_OMIT, error_ref error NLS2_MAY_OMIT) {
    const detail::terminated<4096> path_text(path);
    const detail::terminated<8> mode_text(mode);
    const detail::terminated<256> encoding_text(encoding);
    for (const std::int32_t status : {NLS2_ValidateLocale(where.get()), path_text.status(),
                                      mode_text.status(), encoding_text.status()}) {
      if (!error.report(status, "cannot open", path)) {
        return;
      }
    }
    // The C function looks the encoding up after it has opened, and perhaps emptied, the file.
    UErrorCode failure = U_ZERO_ERROR;
    ucnv_close(ucnv_open(encoding_text.c_str(), &failure));
    if (!error.report(failure, "cannot open a file in", encoding)) {
      return;
    }
    state_ = std::make_unique<state>(where.get(), bad, path);
    errno = 0;
    state_->file.reset(
        NLS2_OpenStream(where.get(), path_text.c_str(), mode_text.c_str(), encoding_text.c_str()));
    if (get() == nullptr) {
      state_.reset();
      error.report({errno != 0 ? errno : ENOMEM, std::generic_category()}, "cannot open", path);
      return;
    }
    state_->count_replaced();
  }
  stream(const locale &&, std::string_view, std::string_view, std::string_view,
         on_bad NLS2_MAY_OMIT, error_ref error NLS2_MAY_OMIT) = delete;

  // A unit that read_line() has looked at waits in this object, not in ICU's.
  [[nodiscard]] UFILE *get() const noexcept { return state_ ? state_->file.get() : nullptr; }
  explicit operator bool() const noexcept { return state_ != nullptr; }

  // How many invalid sequences and lacking characters have been replaced since the stream was
  // opened. Buffered text counts after flush().
  [[nodiscard]] std::size_t replaced() const noexcept { return state_ ? state_->replaced : 0; }

  // Reads units until the span is full or the file ends, and returns how many: fewer than fit only
  // at the end. A surrogate pair may be cut between two reads.
  [[nodiscard]] std::size_t read(std::span<char16_t> out, error_ref error NLS2_MAY_OMIT) {
    if (!check(cannot_read, out.size(), error) || out.empty()) {
      return 0;
    }
    const std::size_t kept = state_->ahead ? 1 : 0;
    if (kept != 0) {
      out[0] = *std::exchange(state_->ahead, {});
    }
    errno = 0;
    const std::int32_t got = NLS2_ReadString(state_->live, get(), out.data() + kept,
                                             detail::to_int32(out.size() - kept));
    report(cannot_read, error);
    return kept + static_cast<std::size_t>(got);
  }

  // Reads a line without its end. False at the end of the file and on failure, when `line` holds
  // what could be read. A line ends in U+000A, U+000B, U+000C, U+000D (with a U+000A that follows),
  // U+0085, U+2028 or U+2029; the last one may have no end. Nulls inside are text.
  [[nodiscard]] bool read_line(std::u16string &line, error_ref error NLS2_MAY_OMIT) {
    line.clear();
    if (!check(cannot_read, 0, error)) {
      return false;
    }
    errno = 0;
    while (append_piece(line) && !ends_line(line.back())) {
    }
    const bool found = report(cannot_read, error) && !line.empty();
    if (found && ends_line(line.back())) {
      take_end(line);
    }
    return found;
  }

  // Writes a text, nulls included.
  void write(std::u16string_view text, error_ref error NLS2_MAY_OMIT) {
    if (check(cannot_write, text.size(), error) && !text.empty()) {
      errno = 0;
      NLS2_WriteString(state_->live, text.data(), detail::to_int32(text.size()), get());
      report(cannot_write, error);
    }
  }

  // Writes a text and a line feed.
  void write_line(std::u16string_view text, error_ref error NLS2_MAY_OMIT) {
    if (check(cannot_write, text.size(), error)) {
      std::error_code failure;
      write(text, failure);
      if (error.report(failure, cannot_write, state_->path)) {
        write(u"\n", error);
      }
    }
  }

  // Writes what is buffered to the file, and ends a shift sequence that the encoding has open.
  void flush(error_ref error NLS2_MAY_OMIT) {
    if (check(cannot_write, 0, error)) {
      errno = 0;
      NLS2_Fflush(get());
      report(cannot_write, error);
    }
  }

  // Flushes, and goes back to the beginning of the file. Clears the system's earlier failures.
  void rewind(error_ref error NLS2_MAY_OMIT) {
    std::error_code failure;
    flush(failure);
    if (state_) {
      NLS2_Frewind(get());
      state_->ahead.reset();
    }
    error.report(failure, cannot_write, path());
  }

  // Flushes and closes; the stream is empty afterwards, whatever the error. The destructor closes
  // as well, but reports nothing.
  void close(error_ref error NLS2_MAY_OMIT) {
    std::error_code failure;
    flush(failure);
    const std::string closed(path());
    state_.reset();
    error.report(failure, cannot_write, closed);
  }

private:
  static constexpr const char *cannot_read = "cannot read";
  static constexpr const char *cannot_write = "cannot write";

  // What the stream's converter points to, so it stays in its place when a stream is moved.
  struct state {
    struct close {
      const NLS2_Locale *live;
      void operator()(UFILE *owned) const noexcept {
        if (NLS2_CloseStream(live, owned) != 0) {
          u_fclose(owned);
        }
      }
    };

    state(const NLS2_Locale *where, on_bad what, std::string_view name)
        : live(where), bad(what), path(name), file(nullptr, close{where}) {}

    // Installs ICU's own callbacks, and a count.
    void count_replaced() noexcept {
      UErrorCode failure = U_ZERO_ERROR;
      UConverter *converter = u_fgetConverter(file.get());
      ucnv_setToUCallBack(converter, to_unicode, this, nullptr, nullptr, &failure);
      ucnv_setFromUCallBack(converter, from_unicode, this, nullptr, nullptr, &failure);
    }
    static bool count(const void *context, UConverterCallbackReason reason) noexcept {
      auto *of = static_cast<state *>(const_cast<void *>(context));
      of->replaced += reason <= UCNV_IRREGULAR ? 1 : 0;
      return reason == UCNV_UNASSIGNED && of->bad == on_bad::replace_visibly;
    }
    static void U_CALLCONV to_unicode(const void *context, UConverterToUnicodeArgs *arguments,
                                      const char *bytes, std::int32_t length,
                                      UConverterCallbackReason reason, UErrorCode *failure) {
      count(context, reason);
      UCNV_TO_U_CALLBACK_SUBSTITUTE(nullptr, arguments, bytes, length, reason, failure);
    }
    static void U_CALLCONV from_unicode(const void *context, UConverterFromUnicodeArgs *arguments,
                                        const UChar *units, std::int32_t length, UChar32 character,
                                        UConverterCallbackReason reason, UErrorCode *failure) {
      if (count(context, reason)) { // ignorable characters too, which ICU drops
        *failure = U_ZERO_ERROR;
        ucnv_cbFromUWriteSub(arguments, 0, failure);
        return;
      }
      UCNV_FROM_U_CALLBACK_SUBSTITUTE(nullptr, arguments, units, length, character, reason,
                                      failure);
    }

    const NLS2_Locale *live;
    on_bad bad;
    std::size_t replaced = 0;
    std::size_t reported = 0; // of these, in earlier calls
    std::string path;
    std::optional<char16_t> ahead;
    std::unique_ptr<UFILE, close> file; // the first to go: closing it may still replace characters
  };

  static bool ends_line(char16_t unit) noexcept {
    return (unit >= 0x0A && unit <= 0x0D) || unit == 0x85 || unit == 0x2028 || unit == 0x2029;
  }

  [[nodiscard]] std::string_view path() const noexcept {
    return state_ ? std::string_view(state_->path) : std::string_view();
  }

  // Without a live locale the C functions do nothing and report nothing.
  bool check(const char *what, std::size_t length, error_ref error) const {
    return error.report(!state_                       ? NLS2_ERR_INVALID_PARAMETER
                        : length > detail::max_length ? detail::too_long
                                                      : NLS2_ValidateLocale(state_->live),
                        what, path());
  }

  // ICU does not report failures of the system; the file below does.
  bool report(const char *what, error_ref error) const {
    const int cause = errno != 0 ? errno : EIO;
    if (std::ferror(u_fgetfile(get())) != 0) {
      return error.report({cause, std::generic_category()}, what, path());
    }
    const bool more = state_->replaced > std::exchange(state_->reported, state_->replaced);
    return error.report(more && state_->bad == on_bad::stop ? U_ILLEGAL_CHAR_FOUND : U_ZERO_ERROR,
                        what, path());
  }

  // Appends the rest of the line, or as much of it as one call reads. False at the end.
  bool append_piece(std::u16string &line) {
    if (state_->ahead) {
      line.push_back(*std::exchange(state_->ahead, {}));
      return true;
    }
    constexpr std::size_t most = 256;
    char16_t piece[most];
    std::char_traits<char16_t>::assign(piece, most, char16_t{0xFFFF});
    if (NLS2_Fgets(state_->live, get(), piece, static_cast<std::int32_t>(most)) == nullptr) {
      return false;
    }
    // The terminator is the last null, since nothing is written after it.
    line.append(piece, std::u16string_view(piece, most).rfind(u'\0'));
    return true;
  }

  // A line feed after a carriage return is in this piece or starts the next one. The next call
  // reports a failure to read it.
  void take_end(std::u16string &line) {
    const char16_t end = line.back();
    line.pop_back();
    if (end == u'\n' && !line.empty() && line.back() == u'\r') {
      line.pop_back();
    }
    char16_t next = 0;
    if (end == u'\r' && NLS2_ReadString(state_->live, get(), &next, 1) == 1 && next != u'\n') {
      state_->ahead = next;
    }
  }

  std::unique_ptr<state> state_;
};

} // namespace NLS2_MODE
} // namespace nls2

#endif
