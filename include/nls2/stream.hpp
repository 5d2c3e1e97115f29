// stream.hpp - files of text in any encoding, read and written as UTF-16.
#ifndef NLS2_STREAM_HPP
#define NLS2_STREAM_HPP

#include "nls2/code_page.hpp"
#include "nls2/detail/common.hpp"
#include "nls2/locale.hpp"

#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <initializer_list>
#include <iterator>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <unicode/ucnv.h>
#include <unicode/ustdio.h>
#include <utility>

namespace nls2 {

// Owns one of ICU's file streams (<unicode/ustdio.h>). Move-only; may own none. Made by
// open_stream(). Bytes that do not convert are read as U+FFFD or U+001A, and characters that the
// encoding lacks are written as its substitution character; neither is a failure.
//
// Errors of the functions below:
//
//   NLS2_ERR_INVALID_PARAMETER  no stream is owned
//   NLS2_ERR_INVALID_LOCALE     the locale that it was opened with is no longer live
//   errno, in std::generic_category(): the system cannot read or write the file. Any later call
//   reports it again (std::errc::io_error) until rewind()
class stream {
public:
  constexpr stream() noexcept = default;
  // `live` is what the stream's calls validate; it is compared, not followed. No stream uses its
  // language or its code page.
  stream(UFILE *owned, const locale &live) noexcept : owned_(owned), live_(live.get()) {}
  stream(stream &&other) noexcept
      : owned_(std::exchange(other.owned_, nullptr)), live_(other.live_),
        ahead_(std::exchange(other.ahead_, {})) {}
  stream &operator=(stream &&other) noexcept {
    const auto *live = other.live_;
    const auto ahead = other.ahead_;
    reset(other.release());
    live_ = live;
    ahead_ = ahead;
    return *this;
  }
  ~stream() { reset(); }

  // A unit that read_line() has looked at waits in this object, not in ICU's.
  UFILE *get() const noexcept { return owned_; }
  explicit operator bool() const noexcept { return owned_ != nullptr; }
  [[nodiscard]] UFILE *release() noexcept {
    ahead_.reset();
    return std::exchange(owned_, nullptr);
  }
  // Closes the stream, whether or not its locale is live, and owns another one with the same
  // locale, or none. A failure to write what is buffered goes unreported: see close().
  void reset(UFILE *owned = nullptr) noexcept {
    if (UFILE *old = std::exchange(owned_, owned); old != nullptr && old != owned) {
      ahead_.reset();
      if (NLS2_CloseStream(live_, old) != 0) {
        u_fclose(old);
      }
    }
  }

  // Reads units until the span is full or the file ends, and returns how many: fewer than fit only
  // at the end. A surrogate pair may be cut between two reads. Error: 31 (too_long) for a span of
  // more than 2,147,483,647 units.
  std::size_t read(std::span<char16_t> out, std::error_code &error) noexcept {
    if (!check(out.size(), error) || out.empty()) {
      return 0;
    }
    const std::size_t kept = ahead_ ? 1 : 0;
    if (ahead_) {
      out[0] = *std::exchange(ahead_, {});
    }
    errno = 0;
    const std::int32_t got =
        NLS2_ReadString(live_, owned_, out.data() + kept, detail::to_int32(out.size() - kept));
    error = failure();
    return kept + static_cast<std::size_t>(got);
  }

  // Reads a line without its end. False at the end of the file and on failure, when `line` holds
  // what could be read. A line ends in U+000A, U+000B, U+000C, U+000D (with a U+000A that follows),
  // U+0085, U+2028 or U+2029; the last one may have no end. Nulls inside are text.
  bool read_line(std::u16string &line, std::error_code &error) {
    line.clear();
    if (!check(0, error)) {
      return false;
    }
    errno = 0;
    while (append_piece(line) && !ends_line(line.back())) {
    }
    error = failure();
    const bool found = !error && !line.empty();
    if (found && ends_line(line.back())) {
      take_end(line);
    }
    return found;
  }

  // Writes a text, nulls included. Error: 31 (too_long) for more than 2,147,483,647 units.
  void write(std::u16string_view text, std::error_code &error) noexcept {
    if (check(text.size(), error)) {
      errno = 0;
      NLS2_WriteString(live_, detail::data_of(text), detail::to_int32(text.size()), owned_);
      error = failure();
    }
  }

  // Writes a text and a line feed.
  void write_line(std::u16string_view text, std::error_code &error) noexcept {
    write(text, error);
    if (!error) {
      write(u"\n", error);
    }
  }

  // Hands the file what is buffered, and ends a shift sequence that the encoding has open.
  void flush(std::error_code &error) noexcept {
    if (check(0, error)) {
      errno = 0;
      NLS2_Fflush(owned_);
      error = failure();
    }
  }

  // Flushes, and goes back to the beginning of the file. The system's failures before are
  // forgotten.
  void rewind(std::error_code &error) noexcept {
    flush(error);
    if (owned_ != nullptr) {
      NLS2_Frewind(owned_);
      ahead_.reset();
    }
  }

  // Flushes and closes; nothing is owned afterwards, whatever the error.
  void close(std::error_code &error) noexcept {
    flush(error);
    reset();
  }

#if NLS2_HAS_EXCEPTIONS
  std::size_t read(std::span<char16_t> out) {
    return detail::or_throw(cannot_read, [&](std::error_code &error) { return read(out, error); });
  }
  bool read_line(std::u16string &line) {
    return detail::or_throw(cannot_read,
                            [&](std::error_code &error) { return read_line(line, error); });
  }
  void write(std::u16string_view text) {
    detail::or_throw(cannot_write, [&](std::error_code &error) { write(text, error); });
  }
  void write_line(std::u16string_view text) {
    detail::or_throw(cannot_write, [&](std::error_code &error) { write_line(text, error); });
  }
  void flush() {
    detail::or_throw(cannot_write, [this](std::error_code &error) { flush(error); });
  }
  void rewind() {
    detail::or_throw(cannot_write, [this](std::error_code &error) { rewind(error); });
  }
  void close() {
    detail::or_throw(cannot_write, [this](std::error_code &error) { close(error); });
  }
#endif

private:
  static constexpr const char *cannot_read = "cannot read the stream";
  static constexpr const char *cannot_write = "cannot write to the stream";

  static bool ends_line(char16_t unit) noexcept {
    return (unit >= 0x0A && unit <= 0x0D) || unit == 0x85 || unit == 0x2028 || unit == 0x2029;
  }

  // Without a live locale the C functions read and write nothing, and say no more.
  bool check(std::size_t length, std::error_code &error) const noexcept {
    error = make_status(owned_ == nullptr             ? NLS2_ERR_INVALID_PARAMETER
                        : length > detail::max_length ? detail::too_long
                                                      : NLS2_ValidateLocale(live_));
    return !error;
  }

  // ICU does not report failures of the system; the file below does.
  std::error_code failure() const noexcept {
    const int cause = errno != 0 ? errno : EIO;
    return std::ferror(u_fgetfile(owned_)) != 0 ? std::error_code(cause, std::generic_category())
                                                : std::error_code();
  }

  // Appends the rest of the line, or as much of it as one call reads. False at the end.
  bool append_piece(std::u16string &line) {
    if (ahead_) {
      line.push_back(*std::exchange(ahead_, {}));
      return true;
    }
    char16_t piece[256];
    std::fill(std::begin(piece), std::end(piece), char16_t{0xFFFF});
    if (NLS2_Fgets(live_, owned_, piece, static_cast<std::int32_t>(std::size(piece))) == nullptr) {
      return false;
    }
    // The terminator is the last null, since nothing is written behind it.
    const auto terminator = std::find(std::rbegin(piece), std::rend(piece), u'\0');
    line.append(std::begin(piece), terminator.base() - 1);
    return true;
  }

  // A line feed after a carriage return comes with it, or starts the next piece. A failure to look
  // there is for the next call to report.
  void take_end(std::u16string &line) noexcept {
    const char16_t end = line.back();
    line.pop_back();
    if (end == u'\n' && !line.empty() && line.back() == u'\r') {
      line.pop_back();
    }
    char16_t next = 0;
    if (end == u'\r' && NLS2_ReadString(live_, owned_, &next, 1) == 1 && next != u'\n') {
      ahead_ = next;
    }
  }

  UFILE *owned_ = nullptr;
  const NLS2_Locale *live_ = nullptr;
  std::optional<char16_t> ahead_;
};

// Opens a file.
//
//   path      handed to the system as it is
//   mode      as for fopen: "r", "w", "a", with "+" to write and read
//   encoding  a converter name of ICU's, such as "UTF-8" or "ibm-1141"; ucnv_getDefaultName() is
//             the process's default
//
// Null on failure. Errors: NLS2_ERR_INVALID_LOCALE; 4 (unknown_code_page) for an encoding that ICU
// does not know, and then the file is as it was; NLS2_ERR_INVALID_PARAMETER for an empty encoding
// and for a null inside an argument; 31 (too_long) for a path of 4,096 bytes, an encoding of 256 or
// a mode of 8; errno in std::generic_category() where the system does not open the file.
//
// Surprises: a directory opens for reading, and the first read fails. "UTF-16" writes a byte-order
// mark and reads with or without one (then big-endian); "UTF-16LE", "UTF-16BE" and "UTF-8" write
// none, and read one as the unit U+FEFF.
inline stream open_stream(const locale &where, std::string_view path, std::string_view mode,
                          std::string_view encoding, std::error_code &error) noexcept {
  const detail::terminated<4096> path_text(path);
  const detail::terminated<8> mode_text(mode);
  const detail::terminated<256> encoding_text(encoding);
  stream opened;
  UErrorCode failure = U_ZERO_ERROR;
  for (const std::int32_t status :
       {NLS2_ValidateLocale(where.get()), path_text.status(), mode_text.status(),
        encoding.empty() ? NLS2_ERR_INVALID_PARAMETER : encoding_text.status()}) {
    if (status != 0) {
      error = make_status(status);
      return opened;
    }
  }
  // The C function looks the encoding up after it has opened, and perhaps emptied, the file.
  converter(ucnv_open(encoding_text.c_str(), &failure)).reset();
  error = make_status(failure);
  if (!error) {
    errno = 0;
    opened = stream(
        NLS2_OpenStream(where.get(), path_text.c_str(), mode_text.c_str(), encoding_text.c_str()),
        where);
    if (!opened) {
      error = {errno != 0 ? errno : ENOMEM, std::generic_category()};
    }
  }
  return opened;
}

#if NLS2_HAS_EXCEPTIONS
inline stream open_stream(const locale &where, std::string_view path, std::string_view mode,
                          std::string_view encoding) {
  return detail::or_throw("cannot open the stream", [&](std::error_code &error) {
    return open_stream(where, path, mode, encoding, error);
  });
}
#endif

} // namespace nls2

#endif
