// Opens code pages, and translators between them.

#include "codepage/code_page.h"

#include "base/icu_memory.h"

namespace nls2::tool {

Page openPage(const std::string &text) {
  NLS2F_Page *page = nullptr;
  const auto number = wholeNumber<int32_t>(text);
  const int32_t status =
      number ? NLS2F_OpenPageByNumber(*number, &page) : NLS2F_OpenPageByName(text.c_str(), &page);
  requireMemory(); // without memory a page seems unknown
  if (status == NLS2_ERR_NO_MEMORY) {
    throw std::bad_alloc();
  }
  return status > 0 ? Page() : Page(page, NLS2F_ClosePage);
}

std::string nearPages(const std::string &asked) {
  char names[192] = "";
  isDone(NLS2F_NearPageNames(asked.c_str(), names, sizeof names));
  return *names == '\0' ? "" : fmt::format(" (did you mean {}?)", names);
}

CodePage::CodePage(const char *option, const std::string &text)
    : page_(openPage(text)), facts_(sized<NLS2F_PageFacts>()) {
  if (!page_) {
    throw usageError("{}: unknown code page {}{}; `nls2 codepages --names` lists the names", option,
                     text.empty() ? "\"\"" : printable(text), nearPages(text));
  }
  isDone(NLS2F_PageInfo(page_.get(), &facts_));
}

Translator openTranslator(const CodePage &from, const CodePage &to, int32_t padding, int32_t onBad,
                          int64_t width) {
  auto policy = sized<NLS2F_Policy>();
  policy.padding = padding;
  policy.onBad = onBad;
  policy.width = width;
  NLS2F_Translator *translator = nullptr;
  isDone(NLS2F_OpenTranslator(from.get(), to.get(), &policy, &translator));
  return Translator(translator);
}

bool translateText(NLS2F_Translator *translator, std::string_view text, std::string &out,
                   NLS2F_Problem &problem) {
  int64_t most = 0;
  int64_t written = 0;
  isDone(NLS2F_MaxSize(translator, sizeOf(text), &most));
  out.resize(static_cast<std::size_t>(most));
  const bool done = isDone(NLS2F_Translate(translator, text.data(), sizeOf(text), out.data(), most,
                                           &written, nullptr, &problem));
  out.resize(static_cast<std::size_t>(written));
  return done;
}

} // namespace nls2::tool
