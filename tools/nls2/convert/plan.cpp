// Checks the options of `nls2 translate`, and reads the layout.

#include "convert/plan.h"

#include "io/input_file.h"

#include <algorithm>

namespace nls2::tool {

namespace {

constexpr uint64_t longestLayout = uint64_t{1} << 24;

bool isCsv(const std::string &format) { return format == "csv" || format.starts_with("csv:"); }

// CSV is UTF-8, so that its page may be omitted.
CodePage pageOf(const char *option, const char *format, bool isCsv,
                const std::optional<CodePage> &page) {
  if (!page && !isCsv) {
    throw usageError("{} PAGE is missing", option);
  }
  CodePage utf8 = CodePage::utf8();
  if (isCsv && page.value_or(utf8) != utf8) {
    throw usageError("{} csv is UTF-8, so {} must be UTF-8 or omitted", format, option);
  }
  return page.value_or(utf8);
}

std::string textOfFile(const std::string &path) {
  InputFile file(path);
  std::string text;
  std::string part(std::size_t{64} << 10, '\0');
  while (const std::size_t got = file.read(part.data(), part.size())) {
    text.append(part, 0, got);
    if (text.size() > longestLayout) {
      throw failure("{} is too long for a layout", file.name());
    }
  }
  return text;
}

Layout openLayout(const TranslateOptions &options, const CodePage &page, bool writes) {
  const std::string text = options.fields ? *options.fields : textOfFile(*options.layout);
  auto problem = sized<NLS2F_Problem>();
  NLS2F_Layout *layout = nullptr;
  const uint32_t flags = (options.fields ? uint32_t{NLS2F_LAYOUT_SHORT} : 0) |
                         (writes ? uint32_t{NLS2F_LAYOUT_WRITES} : 0);
  if (isDone(NLS2F_OpenLayout(text.data(), sizeOf(text), page.get(), flags, &layout, &problem))) {
    return {layout, NLS2F_CloseLayout};
  }
  if (options.fields) {
    throw usageError("--fields: column {}: {}", problem.offset + 1, wordsOf(problem));
  }
  throw usageError("{}: line {}, column {}: {}", shownName(*options.layout, "standard input"),
                   problem.record + 1, problem.offset + 1, wordsOf(problem));
}

int32_t paddingOf(const TranslateOptions &options, const Plan &plan) {
  return plan.joins                                 ? NLS2F_AS_IS
         : plan.writeLength != 0 && !plan.writesCsv ? NLS2F_FILL
         : options.keepsBlanks                      ? NLS2F_KEEP_BLANKS
                                                    : NLS2F_STRIP;
}

std::string nameOf(const FieldPlan &field) {
  return *field.field.name != '\0' ? printable(field.field.name) : std::to_string(field.number);
}

} // namespace

// The first character of a text may come after a signature.
std::string blankOf(const CodePage &page) {
  const Translator translator = openTranslator(CodePage::utf8(), page, NLS2F_AS_IS);
  auto problem = sized<NLS2F_Problem>();
  std::string one;
  std::string two;
  const bool isFine = translateText(translator.get(), " ", one, problem) &&
                      translateText(translator.get(), "  ", two, problem);
  return isFine ? two.substr(one.size()) : "";
}

Plan::Plan(const TranslateOptions &options)
    : from(pageOf("--from", "--read", isCsv(options.read), options.from)),
      to(pageOf("--to", "--write", isCsv(options.write), options.to)),
      readsCsv(isCsv(options.read)), writesCsv(isCsv(options.write)),
      joins(options.write == "joined"), readLength(fixedLength(options.read)),
      writeLength(fixedLength(options.write)),
      hasHeader(options.layout && (readsCsv || writesCsv)) {
  if (readsCsv && writesCsv) {
    throw usageError("--read csv --write csv has nothing to translate: both are UTF-8");
  }
  if (options.layout || options.fields) {
    layout = openLayout(options, readsCsv ? to : from, !writesCsv && !joins);
    addFields(options);
  } else {
    FieldPlan whole(from, to);
    whole.padding = paddingOf(options, *this);
    whole.width = whole.padding == NLS2F_FILL ? writeLength : 0;
    whole.field.length = readLength;
    whole.field.name = "";
    whole.blank = blankOf(from);
    fields.push_back(whole);
  }
  check(options);
}

void Plan::addFields(const TranslateOptions &options) {
  const std::string fromBlank = blankOf(from);
  const std::string toBlank = blankOf(to);
  int64_t count = 0;
  isDone(NLS2F_LayoutSize(layout.get(), &count, &layoutLength));
  for (int64_t i = 0; i < count; ++i) {
    FieldPlan made(from, to);
    made.number = static_cast<std::size_t>(i) + 1;
    isDone(NLS2F_LayoutField(layout.get(), i, &made.field));
    made.padding = fillsLayout() ? NLS2F_FILL : paddingOf(options, *this);
    made.width = made.padding == NLS2F_FILL ? made.field.length : 0;
    if (made.field.page != nullptr) {
      (readsCsv ? made.to : made.from) = CodePage("page", made.field.page);
    }
    made.blank = made.from == from ? fromBlank : blankOf(made.from);
    if (made.field.page != nullptr && made.blank.size() == 1) { // what a short record lacks
      made.field.blank = static_cast<uint8_t>(made.blank[0]);
    }
    made.fillsLater = fillsLayout() && made.to == to && toBlank.size() == 1;
    fields.push_back(made);
  }
}

void Plan::check(const TranslateOptions &options) const {
  const bool isTextInCsv = readsCsv || writesCsv;
  for (const FieldPlan &field : fields) {
    if (field.isNumber() && !isTextInCsv) {
      throw usageError("field {}: numbers need csv on one side", nameOf(field));
    }
    if (field.field.kind == NLS2F_RAW && isTextInCsv) {
      throw usageError("field {}: csv is text; use hex in place of raw", nameOf(field));
    }
  }
  if (readLength != 0 && layoutLength > readLength) {
    throw usageError("the layout has {} bytes, but --read {} has {}", layoutLength,
                     printable(options.read), readLength);
  }
  if (fillsLayout() && writeLength != 0 && layoutLength > writeLength) {
    throw usageError("the layout has {} bytes, but --write {} has {}", layoutLength,
                     printable(options.write), writeLength);
  }
  if (options.keepsBlanks && (joins || writeLength != 0 || fillsLayout())) {
    throw usageError("--blanks keep has no meaning: {}",
                     joins ? "joined texts keep their blanks" : "the records are filled");
  }
}

void Plan::setFrom(const CodePage &page) {
  for (FieldPlan &field : fields) {
    if (field.from == from) {
      field.from = page;
      field.blank = blankOf(page);
    }
  }
  from = page;
}

std::string emptyRecord(const Plan &plan) {
  std::string record(plan.fillsLayout() ? static_cast<std::size_t>(plan.layoutLength) : 0, '\0');
  std::string isField(record.size(), '\0');
  const std::string blank = blankOf(plan.to);
  for (const FieldPlan &field : plan.fields) {
    if (!record.empty() && !field.fillsLater) {
      std::fill_n(isField.begin() + field.field.first, field.field.length, '\1');
    }
  }
  for (std::size_t at = isField.find('\0'); at != std::string::npos; at = isField.find('\0', at)) {
    const std::size_t end = std::min(isField.find('\1', at), record.size());
    if (blank.empty() || (end - at) % blank.size() != 0) {
      throw usageError("blanks of {} cannot fill the bytes {} to {}, which belong to no field",
                       plan.to.name(), at + 1, end);
    }
    for (; at < end; at += blank.size()) {
      record.replace(at, blank.size(), blank);
    }
  }
  return record;
}

} // namespace nls2::tool
