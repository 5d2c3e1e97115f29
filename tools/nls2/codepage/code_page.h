// Code pages by number or by any of ICU's names.
#pragma once

#include "base/engine.h"
#include "base/options.h"

#include <string>

namespace nls2::tool {

// An open code page. Copies share it; any number of threads may use it.
class CodePage {
public:
  // Throws usageError with the option if there is no such page.
  CodePage(const char *option, const std::string &text);
  static CodePage utf8() { return {"UTF-8", "UTF-8"}; }

  const NLS2F_Page *get() const { return page_.get(); }
  const NLS2F_PageFacts &facts() const { return facts_; }
  std::string name() const { return facts_.name; }
  bool operator==(const CodePage &other) const { return name() == other.name(); }

private:
  Page page_;
  NLS2F_PageFacts facts_;
};

// The page that a number or a name opens; null if none does.
Page openPage(const std::string &text);

// " (did you mean cp037?)" for an unknown name; may be empty.
std::string nearPages(const std::string &asked);

template <typename Target>
Option pageValue(const char *name, const char *help, Target &page) {
  return value(name, "PAGE", help, [=, &page](const std::string &text) {
    page = CodePage(fmt::format("--{}", name).c_str(), text);
  });
}

Translator openTranslator(const CodePage &from, const CodePage &to, int32_t padding,
                          int32_t onBad = NLS2F_STOP, int64_t width = 0);

// A text in another page, as it is; nothing if it is not valid, or not in the page. Of a failure
// the problem is described.
bool translateText(NLS2F_Translator *translator, std::string_view text, std::string &out,
                   NLS2F_Problem &problem);

} // namespace nls2::tool
