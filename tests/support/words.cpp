// Reads the words of a call, and shows answers.

#include "support/words.h"

#include "support/case_file.h"

#include <algorithm>
#include <cctype>
#include <cstdio>
#include <unicode/ustdio.h>

namespace support {

namespace {

// Uses up the heap's first block of this size, as the first Words does for streams: under the thread
// sanitizer its address ends in 32 zero bits, which a trace shows as null.
[[maybe_unused]] const auto firstObject = std::make_unique<NLS2_Locale>();

// The first addresses of a sanitizer's heap end in many zero bits and look like small numbers in a
// trace, so the text gets a later block.
std::unique_ptr<char[]> farBlock(const std::string &text) {
  std::vector<std::unique_ptr<char[]>> near;
  while (near.empty() || low32(near.back().get()) < 0x10000) {
    near.push_back(exact(text));
  }
  return std::move(near.back());
}

} // namespace

LiveLocale::LiveLocale(uint32_t codepage, const char *name) {
  int32_t status = -1;
  object_ = NLS2_GetLocale(NLS2_LanguageIDFromShortPosixName(name, &status), codepage, 0, &status);
  if (object_ == nullptr) {
    throw std::runtime_error(std::string("no locale object of ") + name);
  }
}

Words::Words(const std::string &call, NLS2_Locale *given) : given_(given) {
#ifdef __SANITIZE_THREAD__
  [[maybe_unused]] static UFILE *const firstFile = u_fopen("/dev/null", "r", nullptr, nullptr);
#endif
  std::vector<std::string> words = split(call, ' ');
  words.erase(words.begin());
  for (const std::string &word : words) {
    words_.push_back(word == "''" ? "" : CaseLine{"", word, call}.bytes());
    texts_.push_back(word == "null" ? nullptr : farBlock(words_.back()));
    if (word[0] == 'L' && std::isdigit(static_cast<unsigned char>(word[1])) != 0 && word != "L0") {
      const std::size_t slash = word.find('/');
      auto &live = live_[word];
      live = std::make_unique<LiveLocale>(std::stoul(word.substr(1)),
                                          slash == word.npos ? "en_US" : &word[slash + 1]);
      name(live->get(), live_.size() == 1 ? "locale" : "locale" + shown(live_.size()));
    }
  }
}

Words::~Words() {
  if (made_ != nullptr) {
    NLS2_ReleaseLocale(made_);
  }
}

NLS2_Locale *Words::object(std::size_t i) const {
  const std::string &word = words_.at(i);
  if (word == "null" || word == "given") {
    return word == "null" ? nullptr : given_;
  }
  if (const auto live = live_.find(word); live != live_.end()) {
    return live->second->get();
  }
  auto *const own = const_cast<NLS2_Locale *>(&unlisted_);
  if (word == "L0") {
    name(own, "locale");
    return own;
  }
  NLS2_Locale *node = pLocaleObjectList;
  for (char letter = word == "copy" ? 'A' : word[0]; letter > 'A'; --letter) {
    node = node->pNext;
  }
  *own = *node;
  return word == "copy" ? own : node;
}

void Words::made(NLS2_Locale *object) const {
  if (given_ != nullptr && object != nullptr) {
    name(object, "object");
    made_ = object;
  }
}

uint32_t low32(const void *pointer) {
  return static_cast<uint32_t>(reinterpret_cast<uintptr_t>(pointer));
}

std::string shown(const std::string &bytes) {
  std::string text;
  for (const char c : bytes) {
    const auto byte = static_cast<unsigned char>(c);
    char escaped[5] = {c};
    if (byte <= ' ' || byte >= 0x7F || byte == '\\') {
      std::snprintf(escaped, sizeof escaped, byte == 0 ? "\\0" : "\\x%02X", unsigned{byte});
    }
    text += escaped;
  }
  return text.empty() ? "''" : text;
}

std::string shown(const NLS2_Locale &object) {
  char numbers[32];
  std::snprintf(numbers, sizeof numbers, "%u %08X ", object.codepage, object.languageId);
  return numbers + shown(std::string(object.icuLocale));
}

std::string named(const std::string &text, const Names &names) {
  const auto isInWord = [](unsigned char c) { return std::isalnum(c) != 0 || c == '-'; };
  std::map<std::string, std::string> byDigits;
  for (const auto &[pointer, name] : names) {
    char hex[9];
    std::snprintf(hex, sizeof hex, "%X", low32(pointer));
    byDigits[hex] = byDigits[shown(pointer)] = "{" + name + "}";
  }
  std::string result;
  for (auto at = text.begin(); at != text.end();) {
    auto end = std::find_if_not(at, text.end(), isInWord);
    end += end == at ? 1 : 0;
    const auto found = byDigits.find({at, end});
    result += found != byDigits.end() ? found->second : std::string(at, end);
    at = end;
  }
  return result;
}

} // namespace support
