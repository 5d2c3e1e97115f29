// The texts of formats, and how lines end in a page.
#include "records/format.h"

#include "pages/character_bytes.h"
#include "pages/page_traits.h"

#include <charconv>
#include <limits>
#include <utility>

namespace zelfields {
namespace {

using Kind = RecordFormat::Kind;
using End = RecordFormat::End;

struct KindName {
  std::string_view name;
  Kind kind;
};
constexpr KindName kindNames[] = {{"fixed", Kind::fixed},       {"lines", Kind::lines},
                                  {"prefixed", Kind::prefixed}, {"blocked", Kind::blocked},
                                  {"csv", Kind::csv},           {"joined", Kind::joined}};

bool applyLength(std::string_view word, RecordFormat &format) {
  const char *const end = word.data() + word.size();
  const auto [stop, error] = std::from_chars(word.data(), end, format.length);
  return error == std::errc() && stop == end && format.length >= 1 &&
         format.length <= std::numeric_limits<int32_t>::max();
}

// Every suffix counts once.
bool applySuffix(std::string_view word, RecordFormat &format) {
  const auto set = [](bool &flag) { return !std::exchange(flag, true); };
  if (format.kind == Kind::prefixed) {
    return word == "data" ? set(format.dataOnly) : word == "little" && set(format.little);
  }
  const bool isLines = format.kind == Kind::lines;
  if (format.end != End::any || (!isLines && format.kind != Kind::csv)) {
    return false;
  }
  format.end = word == "crlf"             ? End::crlf
               : isLines && word == "lf"  ? End::lf
               : isLines && word == "nel" ? End::nel
                                          : End::any;
  return format.end != End::any;
}

// Searching bytes finds characters only if no character's bytes can hold another's. That is so for
// LF and CR, and for single bytes, in every page with stateless lines, and for Unicode's encodings
// in units of 8, 16 or 32 bits.
bool hasLines(UConverterType type) {
  return isSingleByte(type) || isMixed(type) ||
         (isUnicode(type) && !isOneOf(type, {UCNV_SCSU, UCNV_IMAP_MAILBOX}));
}

} // namespace

bool parseFormat(std::string_view text, RecordFormat &format, ProblemFacts &fault) {
  const char *const begin = text.data();
  std::size_t end = std::min(text.find(':'), text.size());
  const auto *found =
      std::find_if(std::begin(kindNames), std::end(kindNames),
                   [&](const KindName &kind) { return kind.name == text.substr(0, end); });
  if (found == std::end(kindNames)) {
    return failFormat(fault, Detail::unknownFormat);
  }
  format.kind = found->kind;
  text.remove_prefix(end);
  while (!text.empty()) {
    text.remove_prefix(1);
    end = std::min(text.find(':'), text.size());
    const std::string_view word = text.substr(0, end);
    const bool isLength = format.kind == Kind::fixed && format.length == 0;
    if (isLength ? !applyLength(word, format) : !applySuffix(word, format)) {
      return failFormat(fault, isLength ? Detail::badRecordLength : Detail::unknownSuffix,
                        text.data() - begin);
    }
    text.remove_prefix(end);
  }
  return format.kind != Kind::fixed || format.length != 0 ||
         failFormat(fault, Detail::badRecordLength, text.data() - begin);
}

bool findLineEnds(const NLS2F_Page &page, End end, LineEnds &ends, ProblemFacts &fault) {
  const UConverterType type = ucnv_getType(page.converter.getAlias());
  if (!hasLines(type)) {
    return failFormat(fault, Detail::dependentLines);
  }
  const std::string lf = bytesOf(page, u'\n');
  const std::string cr = bytesOf(page, u'\r');
  std::string nel = bytesOf(page, u'\u0085');
  if (nel.size() != 1 && (!isUnicode(type) || isOneOf(type, {UCNV_UTF7, UCNV_BOCU1}))) {
    nel.clear();
  }
  ends.unit = std::max<std::size_t>(lf.size(), 1);
  ends.main = end == End::nel            ? nel
              : end != End::crlf         ? lf
              : cr.empty() || lf.empty() ? ""
                                         : cr + lf;
  if (end == End::any) {
    ends.strip = cr;
    ends.other = nel;
  }
  return !ends.main.empty() || failFormat(fault, Detail::noLineEnd);
}

} // namespace zelfields
