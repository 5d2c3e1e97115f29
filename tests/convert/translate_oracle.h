// What NLS2_TranslateString must answer, by the rules of the header over bare ICU: whole texts
// converted into buffers that are large enough, then cut.
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

template <class To, class From, class Convert>
std::basic_string<To> converted(const Page &page, const std::basic_string<From> &text,
                                Convert convert) {
  UErrorCode error = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(ucnv_open(page.icuName, &error));
  std::basic_string<To> result(text.size() * 8 + 16, To{0});
  result.resize(static_cast<size_t>(convert(converter.getAlias(), result.data(),
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

// As much as fits, and a zero byte where there is room for it.
inline void put(std::string &dest, const std::string &bytes, int32_t room) {
  const size_t fits = std::min(bytes.size(), static_cast<size_t>(room));
  dest.replace(0, fits, bytes, 0, fits);
  if (fits < static_cast<size_t>(room)) {
    dest[fits] = 0;
  }
}

inline Outcome direct(const Request &request, const std::string &source, std::string dest) {
  const std::string bytes = encode(request.dest, decode(request.source, source));
  const auto length = static_cast<int32_t>(bytes.size());
  put(dest, bytes, request.destLen);
  if (length > request.destLen) {
    return {0, 15, 0, dest};
  }
  int32_t result = length;
  if (length < request.destLen && (request.options == 8 || request.sourceLen == -1)) {
    result += request.dest.terminator;
    std::fill(dest.begin() + length, dest.begin() + result, '\0');
  }
  return {result, 0, static_cast<int32_t>(source.size()), dest};
}

// FILL and TRAILING: `work` holds the text and zero units behind it, save what an inner null cut.
inline Outcome padded(const Request &request, std::u16string work, size_t textLength, size_t blanks,
                      int32_t room, int32_t terminator, std::string dest) {
  size_t units = static_cast<size_t>(room);
  if ((request.options & 0x100) == 0) {
    units = std::min(units, textLength + blanks);
  }
  for (size_t i = textLength; i < units; ++i) {
    work[i] = u' ';
  }
  std::string bytes = encode(request.dest, work.substr(0, units));
  put(dest, bytes, room);
  const auto excess = static_cast<int32_t>(bytes.size()) - room;
  if (excess > 0) {
    const int32_t left = static_cast<int32_t>(units) - excess;
    if (left < -1) {
      return {0, U_ILLEGAL_ARGUMENT_ERROR, 0, dest};
    }
    // ICU takes -1 for a null-terminated text.
    bytes = encode(request.dest, left < 0 ? work.substr(0, work.find(u'\0'))
                                          : work.substr(0, static_cast<size_t>(left)));
    put(dest, bytes, room);
    if (bytes.size() > static_cast<size_t>(room)) {
      return {0, 15, 0, dest};
    }
  }
  std::fill_n(dest.begin() + room, terminator, '\0');
  return {room + terminator, 0, 0, dest};
}

inline Outcome shaped(const Request &request, const std::string &source, std::string dest) {
  std::u16string work = decode(request.source, source);
  size_t end = work.size();
  size_t blanks = 0;
  for (; end > 0 && (work[end - 1] == 0 || u_isblank(work[end - 1]) != 0); --end) {
    blanks += work[end - 1] != 0 ? 1 : 0;
  }
  std::fill(work.begin() + static_cast<std::ptrdiff_t>(end), work.end(), u'\0');
  work.resize(std::max(work.size(), static_cast<size_t>(request.destLen)) + 1);
  const std::u16string text = work.substr(0, work.find(u'\0'));
  const std::string bytes = encode(request.dest, text);
  const int32_t terminator = (request.options & 8) != 0 ? request.dest.terminator : 0;
  const int32_t room = request.destLen - terminator;
  if (static_cast<int32_t>(bytes.size()) > room) {
    return {0, 15, 0, dest};
  }
  if ((request.options & 0x4000) != 0) {
    put(dest, bytes, room);
    return {static_cast<int32_t>(text.size()) + terminator, 0, 0, dest};
  }
  return padded(request, work, text.size(), blanks, room, terminator, dest);
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
