// Opens and closes readers, and finds the records in a piece of an input.
#include "records/reader.h"

#include "pages/character_bytes.h"
#include "pages/page_traits.h"

#include <memory>
#include <new>

namespace zelfields {
namespace {

using Kind = RecordFormat::Kind;

bool addPage(const NLS2F_Page &page, NLS2F_Reader &reader, ProblemFacts &fault) {
  NLS2F_Reader::MarkedPage made;
  UErrorCode error = U_ZERO_ERROR;
  const UConverter *converter = page.converter.getAlias();
  made.name = ucnv_getName(converter, &error);
  made.mark = hasStates(ucnv_getType(converter)) ? "" : bytesOf(page, u'\uFEFF');
  if (!findLineEnds(page, reader.format.end, made.ends, fault)) {
    return false;
  }
  reader.pages.push_back(std::move(made));
  return true;
}

bool addPage(const char *name, NLS2F_Reader &reader, ProblemFacts &fault) {
  NLS2F_Page *opened = nullptr;
  if (NLS2F_OpenPageByName(name, &opened) > 0) {
    throw std::bad_alloc(); // ICU has these
  }
  const std::unique_ptr<NLS2F_Page, decltype(&NLS2F_ClosePage)> page(opened, NLS2F_ClosePage);
  return addPage(*page, reader, fault);
}

bool addPages(const NLS2F_Page *page, NLS2F_Reader &reader, ProblemFacts &fault) {
  if (reader.format.kind == Kind::csv) {
    reader.pages.push_back({"\xEF\xBB\xBF", "UTF-8", {}});
    return true;
  }
  if (reader.format.kind == Kind::lines && page == nullptr) {
    return failFormat(fault, Detail::needsPage);
  }
  if (reader.format.kind == Kind::lines) {
    switch (ucnv_getType(page->converter.getAlias())) {
    case UCNV_UTF16:
      return addPage("UTF-16BE", reader, fault) && addPage("UTF-16LE", reader, fault);
    case UCNV_UTF32:
      return addPage("UTF-32BE", reader, fault) && addPage("UTF-32LE", reader, fault);
    default:
      return addPage(*page, reader, fault);
    }
  }
  UErrorCode error = U_ZERO_ERROR;
  const char *name = page != nullptr ? ucnv_getName(page->converter.getAlias(), &error) : "";
  reader.pages.push_back({"", name, {}});
  return true;
}

// Takes a mark off the beginning of the input. False if more is needed to see whether it is one.
bool takeMark(NLS2F_Reader &reader, Piece &piece) {
  for (std::size_t i = 0; i < reader.pages.size(); ++i) {
    const std::string &mark = reader.pages[i].mark;
    if (!piece.isLast && piece.text.size() < mark.size() && mark.starts_with(piece.text)) {
      return false;
    }
    if (!mark.empty() && piece.text.starts_with(mark)) {
      reader.page = i;
      piece.at = mark.size();
    }
  }
  return true;
}

Found nextFixed(int64_t length, Piece &piece) {
  const auto size = static_cast<std::size_t>(length);
  if (piece.rest().size() >= size) {
    return piece.found(piece.at, size, piece.at + size);
  }
  return piece.isLast && !piece.rest().empty() ? piece.failed(NLS2F_CUT_SHORT, piece.at, length)
                                               : Found::more;
}

Found next(NLS2F_Reader &reader, Piece &piece) {
  switch (reader.format.kind) {
  case Kind::fixed:
    return nextFixed(reader.format.length, piece);
  case Kind::lines:
    return nextLine(reader.pages[reader.page].ends, piece, reader.state);
  case Kind::csv:
    return nextCsv(piece, reader.state);
  default:
    return nextPrefixed(reader.format, piece, reader.state.total, reader.state.blockEnd);
  }
}

// At the beginning of the input.
bool begin(NLS2F_Reader &reader, Piece &piece) {
  const bool hasPrefixes =
      reader.format.kind == Kind::prefixed || reader.format.kind == Kind::blocked;
  reader.state.hint = hasPrefixes ? hintFor(reader.format, piece) : Detail::none;
  return takeMark(reader, piece);
}

int32_t report(const NLS2F_Reader &reader, ProblemFacts facts, NLS2F_Problem *problem) {
  facts.record = reader.state.records;
  facts.offset += reader.state.total;
  const Detail hint = facts.record < prefixesForHint ? reader.state.hint : Detail::none;
  if (hint != Detail::none || facts.kind == NLS2F_INVALID_PREFIX) {
    facts.kind = facts.kind == NLS2F_SPANNED ? NLS2F_SPANNED : NLS2F_INVALID_PREFIX;
    facts.needed = static_cast<int64_t>(hint);
  }
  return setProblem(problem, facts);
}

} // namespace
} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_OpenReader(const char *format, const NLS2F_Page *page, NLS2F_Reader **reader,
                         NLS2F_Problem *problem) {
  if (!cleared(reader) || format == nullptr || !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return guarded([&]() -> int32_t {
    auto made = std::make_unique<NLS2F_Reader>();
    ProblemFacts fault;
    if (!parseFormat(format, made->format, fault) ||
        (made->format.kind == Kind::joined && !failFormat(fault, Detail::onlyWritten)) ||
        !addPages(page, *made, fault)) {
      return setProblem(problem, fault);
    }
    *reader = made.release();
    return 0;
  });
}

void NLS2F_CloseReader(NLS2F_Reader *reader) { delete reader; }

int32_t NLS2F_ReadRecords(NLS2F_Reader *reader, const void *piece, int64_t length, int32_t last,
                          int64_t *read, NLS2F_Span *records, int64_t capacity, int64_t *count,
                          NLS2F_Problem *problem) {
  if (!cleared(read, count) || reader == nullptr || !isRange(piece, length) ||
      !isRange(records, capacity) || !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  Piece input{viewOf(piece, length), last != 0};
  if (reader->state.total == 0 && capacity > 0 && !begin(*reader, input)) {
    return 0;
  }
  Found found = Found::record;
  while (*count < capacity && (found = next(*reader, input)) == Found::record) {
    records[(*count)++] = input.record;
    *read = static_cast<int64_t>(input.at);
  }
  if (found == Found::problem && *count == 0) {
    return report(*reader, input.problem, problem);
  }
  reader->state.total += *read;
  reader->state.records += *count;
  return 0;
}

int32_t NLS2F_ReaderPage(const NLS2F_Reader *reader, const char **name) {
  if (reader == nullptr || name == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  *name = reader->pages[reader->page].name.c_str();
  return 0;
}
