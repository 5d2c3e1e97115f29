// NLS2_TranslateString with all options and capacities, compared with nls2.h's rules over bare ICU.

#include "nls2.h"
#include "property.h"

#include <unicode/uchar.h>

namespace {

using property::check;
using property::Input;
using property::Page;
using support::decode;
using support::encode;

struct Request {
  Page source;
  Page dest;
  std::string bytes; // the source; with a negative sourceLen cut at its first zero byte
  int32_t sourceLen;
  uint32_t options;
};

struct Outcome {
  int32_t result;
  int32_t status;
  int32_t consumed;
  std::string dest; // the whole buffer
};

bool isDirect(uint32_t options) { return options == 0 || options == NLS2_STRING_TERMINATE; }

Outcome direct(const Request &request, const std::string &source, int32_t destLen,
               std::string dest) {
  const std::string bytes = encode(request.dest, decode(request.source, source));
  const auto length = static_cast<int32_t>(bytes.size());
  std::copy_n(bytes.begin(), std::min(length, destLen), dest.begin());
  if (length > destLen) {
    return {0, U_BUFFER_OVERFLOW_ERROR, 0, dest};
  }
  if (length < destLen) {
    dest[bytes.size()] = 0;
  }
  int32_t result = length;
  if (length < destLen && (request.options != 0 || request.sourceLen == -1)) {
    result += request.dest.terminator;
    std::fill(dest.begin() + length, dest.begin() + result, '\0');
  }
  return {result, 0, static_cast<int32_t>(source.size()), dest};
}

// Measures and writes with the same room as the library, because ICU may measure a text too short, such
// as ISCII that begins with a substitution.
Outcome shaped(const Request &request, const std::string &source, int32_t destLen,
               std::string dest) {
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
  work.resize(static_cast<size_t>(std::max(measured, destLen)) + 1);
  const auto text = static_cast<int32_t>(work.find(u'\0'));
  const auto put = [&](int32_t units, int32_t room) { // -1: up to the first null
    error = U_ZERO_ERROR;
    return ucnv_fromUChars(to.getAlias(), dest.data(), room, work.data(), units, &error);
  };
  const bool terminate = (request.options & NLS2_STRING_TERMINATE) != 0;
  const int32_t terminator = terminate ? request.dest.terminator : 0;
  const int32_t room = destLen - terminator;
  if (put(text, 0) > room) {
    return {0, U_BUFFER_OVERFLOW_ERROR, 0, dest};
  }
  const bool strip = (request.options & NLS2_STRING_STRIP_TRAILING) != 0;
  const bool fill = (request.options & NLS2_STRING_FILL) != 0;
  const int32_t units = strip ? text : fill ? room : std::min(room, text + blanks);
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

// `dest` is the buffer before the call.
Outcome expected(const Request &request, int32_t destLen, const std::string &dest) {
  constexpr uint32_t actions =
      NLS2_STRING_FILL | NLS2_STRING_TRAILING | NLS2_STRING_STRIP_TRAILING | NLS2_STRING_TERMINATE;
  const bool isAllowed = request.options == 0 || (request.options & actions) != 0;
  if (!isAllowed || (destLen == 0 && request.sourceLen != 0)) {
    return {0, NLS2_ERR_INVALID_PARAMETER, 0, dest};
  }
  if (request.sourceLen == 0) {
    return {0, 0, 0, dest};
  }
  const std::string source =
      request.sourceLen < 0 ? request.bytes.substr(0, request.bytes.find('\0')) : request.bytes;
  return isDirect(request.options) ? direct(request, source, destLen, dest)
                                   : shaped(request, source, destLen, dest);
}

void compare(const Request &request, int32_t destLen) {
  // On the direct path a terminator's second zero byte may go past destLen.
  const bool isLonger = isDirect(request.options) && request.dest.terminator == 2;
  const std::string before(static_cast<size_t>(destLen) + (isLonger ? 1 : 0), '#');
  const property::Output<char> dest(before.size());
  std::copy(before.begin(), before.end(), dest.get());
  const auto source =
      property::exact(request.sourceLen < 0 ? property::terminated(request.bytes) : request.bytes);
  int32_t consumed = -1;
  int32_t status = -1;
  const int32_t result =
      NLS2_TranslateString(request.dest.number, dest.get(), destLen, request.source.number,
                           source.get(), request.sourceLen, &consumed, request.options, &status);
  const Outcome right = expected(request, destLen, before);
  if (status == U_BUFFER_OVERFLOW_ERROR && right.status == 0 && right.result == destLen) {
    return; // ICU wants room for pending characters that take no bytes
  }
  check(status == right.status, "status");
  check(result == right.result, "result");
  check(consumed == right.consumed, "bytes consumed");
  for (size_t i = 0; status == 0 && i < before.size(); ++i) {
    // ICU's Latin-1 converter may change the room after its output.
    check(right.dest[i] == '#' || dest.get()[i] == right.dest[i], "bytes");
  }
}

// Every padding, also with bits that are ignored, and options that are refused.
constexpr uint32_t optionSets[] = {0,      8,      0x100,  0x108,  0x200,  0x208,  0x300,   0x308,
                                   0x4000, 0x4008, 0x4100, 0x4308, 0x1201, 0x4029, 0x40001, 1};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  Input input(data, size);
  const Page from = input.page();
  const uint32_t options = input.oneOf(optionSets);
  Request request{from, input.page(), "", 0, options};
  const size_t length = input.below(3);
  const auto room = static_cast<int32_t>(input.below(201));
  request.bytes = input.text(from);
  request.sourceLen =
      length == 0 ? static_cast<int32_t>(request.bytes.size()) : -static_cast<int32_t>(length);
  // All capacities up to a little more than needed.
  const size_t whole = encode(request.dest, decode(from, request.bytes)).size() + 4;
  for (int32_t destLen = 0; destLen <= static_cast<int32_t>(whole) && whole <= 80; ++destLen) {
    compare(request, destLen);
  }
  compare(request, room);
  return 0;
}
