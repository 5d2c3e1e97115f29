// What NLS2_TranslateString must answer, by the rules of the header over bare ICU.
#pragma once

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <string>
#include <unicode/localpointer.h>
#include <unicode/uchar.h>
#include <unicode/ucnv.h>

namespace oracle {

struct Page {
  int32_t number;
  const char *icuName;
  int32_t terminator; // zero bytes that end a string
};

struct Request {
  const Page &source;
  const Page &dest;
  std::string bytes; // the source; with a negative sourceLen cut at its first zero byte
  int32_t sourceLen;
  int32_t destLen;
  uint32_t options;
};

struct Outcome {
  int32_t result;
  int32_t status;
  int32_t consumed;
  std::string dest; // the whole buffer
};

inline icu::LocalUConverterPointer open(const Page &page) {
  UErrorCode error = U_ZERO_ERROR;
  return icu::LocalUConverterPointer(ucnv_open(page.icuName, &error));
}

template <class To, class From, class Convert>
std::basic_string<To> converted(const Page &page, const std::basic_string<From> &text,
                                Convert convert) {
  UErrorCode error = U_ZERO_ERROR;
  std::basic_string<To> result(text.size() * 8 + 16, To{0});
  result.resize(static_cast<size_t>(convert(open(page).getAlias(), result.data(),
                                            static_cast<int32_t>(result.size()), text.data(),
                                            static_cast<int32_t>(text.size()), &error)));
  return result;
}
inline std::u16string decode(const Page &page, const std::string &bytes) {
  return converted<char16_t>(page, bytes, ucnv_toUChars);
}
inline std::string encode(const Page &page, const std::u16string &text) {
  return converted<char>(page, text, ucnv_fromUChars);
}

inline Outcome direct(const Request &request, const std::string &source, std::string dest) {
  const std::string bytes = encode(request.dest, decode(request.source, source));
  const auto length = static_cast<int32_t>(bytes.size());
  std::copy_n(bytes.begin(), std::min(length, request.destLen), dest.begin());
  if (length > request.destLen) {
    return {0, 15, 0, dest};
  }
  if (length < request.destLen) {
    dest[bytes.size()] = 0;
  }
  int32_t result = length;
  if (length < request.destLen && (request.options == 8 || request.sourceLen == -1)) {
    result += request.dest.terminator;
    std::fill(dest.begin() + length, dest.begin() + result, '\0');
  }
  return {result, 0, static_cast<int32_t>(source.size()), dest};
}

// Measured and written with the room that the rules give, since ICU may measure a text too short: in
// ISCII, one that begins with a substitution.
inline Outcome shaped(const Request &request, const std::string &source, std::string dest) {
  const auto from = open(request.source);
  const auto to = open(request.dest);
  UErrorCode error = U_ZERO_ERROR;
  const auto decoded = [&](UChar *units, int32_t room) {
    error = U_ZERO_ERROR;
    return ucnv_toUChars(from.getAlias(), units, room, source.data(),
                         static_cast<int32_t>(source.size()), &error);
  };
  const int32_t measured = decoded(nullptr, 0);
  std::u16string work(static_cast<size_t>(measured), u'\0');
  decoded(work.data(), measured);
  if (error > U_ZERO_ERROR) {
    return {0, error, 0, dest};
  }
  size_t end = work.size();
  int32_t blanks = 0;
  for (; end > 0 && (work[end - 1] == 0 || u_isblank(work[end - 1]) != 0); --end) {
    blanks += work[end - 1] != 0 ? 1 : 0;
  }
  work.resize(end);
  work.resize(static_cast<size_t>(std::max(measured, request.destLen)) + 1);
  const auto text = static_cast<int32_t>(work.find(u'\0'));
  const auto put = [&](int32_t units, int32_t room) { // ICU takes -1 for all up to a null
    error = U_ZERO_ERROR;
    return ucnv_fromUChars(to.getAlias(), dest.data(), room, work.data(), units, &error);
  };
  const int32_t terminator = (request.options & 8) != 0 ? request.dest.terminator : 0;
  const int32_t room = request.destLen - terminator;
  if (put(text, 0) > room) {
    return {0, U_BUFFER_OVERFLOW_ERROR, 0, dest};
  }
  const bool strip = (request.options & 0x4000) != 0;
  const int32_t padded = (request.options & 0x100) != 0 ? room : std::min(room, text + blanks);
  const int32_t units = strip ? text : padded;
  std::fill(work.begin() + text, work.begin() + std::max(text, units), u' ');
  const int32_t bytes = put(units, room);
  if (error == U_BUFFER_OVERFLOW_ERROR && !strip) {
    put(units - (bytes - room), room);
  }
  if (error > U_ZERO_ERROR) {
    return {0, error, 0, dest};
  }
  if (!strip) {
    std::fill_n(dest.begin() + room, terminator, '\0');
  }
  return {(strip ? text : room) + terminator, 0, 0, dest};
}

// `dest` is the buffer as it is before the call.
inline Outcome translate(const Request &request, const std::string &dest) {
  const bool optionsAllowed = request.options == 0 || (request.options & 0x4308) != 0;
  if (!optionsAllowed || (request.destLen == 0 && request.sourceLen != 0)) {
    return {0, 37, 0, dest};
  }
  if (request.sourceLen == 0) {
    return {0, 0, 0, dest};
  }
  const std::string source =
      request.sourceLen < 0 ? request.bytes.substr(0, request.bytes.find('\0')) : request.bytes;
  return request.options == 0 || request.options == 8 ? direct(request, source, dest)
                                                      : shaped(request, source, dest);
}

} // namespace oracle
