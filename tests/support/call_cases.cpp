// Runs calls that stand in case files.

#include "support/call_cases.h"

#include "support/case_file.h"
#include "support/recording_host.h"

#include <algorithm>
#include <cctype>
#include <cstring>
#include <fstream>
#include <gtest/gtest.h>
#include <optional>
#include <sstream>

namespace support {

namespace {

// A heap whose first block of a size has an address that ends in 32 zero bits, as the thread
// sanitizer's has, gives it away here: in a trace it would look like null.
[[maybe_unused]] const auto firstObject = std::make_unique<NLS2_Locale>();
NLS2_Locale never = {0x03480001, 1208, "en_US", nullptr};

const std::vector<std::string> traceKeys = {"|", "dump", "calls", "icu", "host", "=", "..."};

struct Settings {
  World world;
  int made = 0;
  std::string call;
};

void apply(Settings &settings, const std::string &key, const std::string &value) {
  std::istringstream words(value);
  if (key == "default") {
    settings.world.locale = value == "''" ? "" : value;
  } else if (key == "codepages") {
    settings.world.codepages.clear();
    for (std::string word; std::getline(words, word, ',');) {
      settings.world.codepages.push_back(word);
    }
  } else if (key == "made") {
    words >> settings.made;
  } else if (key == "call") {
    settings.call = value;
  } else {
    Fault fault{key, 0};
    int error = fault.error;
    words >> fault.nth >> error;
    fault.nth = value == "object" ? static_cast<long>(sizeof(NLS2_Locale)) : fault.nth;
    fault.error = static_cast<UErrorCode>(words.fail() ? fault.error : error);
    settings.world.faults.push_back(fault);
  }
}

// What a sanitizer's heap neither refuses nor counts is left out.
bool canHappen(const Settings &settings, const std::string &expected) {
  return heapIsOurs || (expected.find("blocks left") == expected.npos &&
                        std::ranges::none_of(settings.world.faults, [](const Fault &fault) {
                          return fault.function.find("alloc") != std::string::npos;
                        }));
}

// Gives the next letters to those live objects that have no name yet, and describes the lettered.
std::string listed(Names &names) {
  std::string text;
  for (const NLS2_Locale *node = pLocaleObjectList; node != nullptr; node = node->pNext) {
    const auto letters =
        std::ranges::count(names, 1U, [](const auto &pair) { return pair.second.size(); });
    const std::string letter(1, static_cast<char>('A' + letters));
    if (const std::string &name = names.emplace(node, letter).first->second; name.size() == 1) {
      text += ", " + name + " " + shown(*node);
    }
  }
  return text;
}

// A sanitizer's heap begins where addresses end in zero bits: in a trace its first blocks look like
// small numbers, so the text gets a block beyond those.
std::unique_ptr<char[]> farBlock(const std::string &text) {
  std::vector<std::unique_ptr<char[]>> near;
  while (near.empty() || low32(near.back().get()) < 0x10000) {
    near.push_back(exact(text));
  }
  return std::move(near.back());
}

// The text with pointers, in hex or as signed numbers, replaced by their names.
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

// The trace of `function` as a case has it, what it calls folded.
std::vector<std::string> folded(const std::string &function,
                                const std::vector<std::string> &lines) {
  std::vector<std::string> own;
  int depth = 0;
  for (const std::string &line : lines) {
    const std::size_t end = line.find_first_of(" :=#>");
    const std::string name = line.substr(0, end);
    std::string text = line.substr(end + 1);
    for (std::size_t tab = 0; (tab = text.find('\t')) != text.npos;) {
      text.replace(tab, 1, "\\t");
    }
    if (depth == 0 && line != function + "> entry") {
      own.push_back("outside of the call: " + line);
    } else if (line[end] == '>') {
      ++depth;
    } else if (line[end] == '=') {
      if (--depth < 2) {
        const std::string value = text.empty() ? " none" : text;
        own.push_back((depth == 0 ? "=" : "calls " + name + " =") + value);
      }
    } else if (name == function) {
      own.push_back((line[end] == '#' ? "dump" : "|") + text);
    } else if (line[end] == ' ' && depth == 1) {
      own.push_back(line);
    }
    if (!own.empty() && own.back().back() == ' ') {
      own.back().replace(own.back().size() - 1, 1, "\\x20");
    }
  }
  return own;
}

// What the call leaves behind, and gives it back.
std::string leftBehind(int converters, int blocks, Names &names) {
  std::string text;
  if (openConverters() != converters) {
    text += ", converters left " + shown(openConverters() - converters);
  }
  if (openBlocks() != blocks) {
    text += ", blocks left " + shown(openBlocks() - blocks);
  }
  return text + listed(names);
}

// The trace of the settings' call, its lines joined by blanks; at its end the answer.
std::string run(const Functions &functions, const Settings &settings, TraceFlags flags) {
  world = {};
  for (int i = 0; i < settings.made; ++i) {
    int32_t status = 0;
    NLS2_allocateLocale(&status);
  }
  std::string trace;
  {
    const Words words(settings.call);
    Names &names = words.names();
    words.name(&never, "never");
    listed(names);
    const std::string function = settings.call.substr(0, settings.call.find(' '));
    const int blocks = openBlocks();
    const int converters = openConverters();
    openedConverters();
    world = settings.world;
    std::string answer;
    std::vector<std::string> lines;
    {
      const Recording recording(flags);
      answer = functions.at(function)(words);
      lines = folded(function, recording.lines());
    }
    world = {};
    if (flags == traceAll && !lines.empty()) {
      const bool isValue = "= " + answer.substr(0, answer.find(',')) == lines.back();
      answer = isValue ? "= " + answer : lines.back() + ", " + answer;
      lines.pop_back();
      for (const std::string &line : lines) {
        trace += line + " ";
      }
    }
    trace += answer + leftBehind(converters, blocks, names);
    for (const void *converter : openedConverters()) {
      words.name(converter, "converter");
    }
    trace = named(trace, names);
  }
  while (pLocaleObjectList != nullptr && NLS2_ReleaseLocale(pLocaleObjectList) == 0) {
  }
  return trace;
}

// One thing a line, for a report.
std::string broken(std::string text) {
  for (const std::string start : {" | ", " calls ", " icu ", " host ", " dump "}) {
    for (std::size_t at = 0; (at = text.find(start, at)) != text.npos;) {
      text[at] = '\n';
    }
  }
  return text;
}

void expectCall(const std::string &expected, const Functions &functions, const Settings &settings,
                TraceFlags flags, const std::string &place) {
  if (!canHappen(settings, expected)) {
    return;
  }
  [[maybe_unused]] std::optional<MeantLeak> leak;
  if (expected.find(" left ") != expected.npos) {
    leak.emplace();
  }
  std::string actual = run(functions, settings, flags);
  const std::string gap = "... ";
  const std::size_t at = expected.find(gap + "| ");
  if (at != expected.npos && actual.size() + gap.size() > expected.size()) {
    actual.replace(at, actual.size() + gap.size() - expected.size(), gap);
  }
  std::string file = place + ".actual";
  std::ranges::replace_if(
      file, [](char c) { return c == '/' || c == ':'; }, '_');
  if (actual != expected) {
    std::ofstream(file) << broken(actual);
  }
  EXPECT_EQ(broken(expected), broken(actual)) << place << "\nThe whole text: " << file;
}

void expectPlain(const Functions &functions, Settings settings, const CaseLine &line) {
  const auto [call, answer] = line.split(" -> ");
  settings.call = call;
  expectCall(answer.value, functions, settings, traceOff, line.place);
  if (line.key == "plain") {
    expectCall(answer.value, functions, settings, traceDetail, line.place);
  }
}

void expectOther(const Functions &functions, Settings settings, const CaseLine &line,
                 const std::string &before) {
  const auto [setting, rest] = line.split(": ");
  const auto [key, value] = CaseLine{line.key, setting, line.place}.split(" ");
  apply(settings, key, value.value);
  expectCall(before + rest.value, functions, settings, traceAll, line.place);
}

void expectCase(const Functions &functions, const Case &c) {
  Settings settings;
  std::string trace; // each line with a blank at its end
  for (const CaseLine &line : c.lines) {
    if (line.key == "plain" || line.key == "untraced") {
      expectPlain(functions, settings, line);
    } else if (line.key == "or") {
      expectOther(functions, settings, line, trace);
    } else if (std::ranges::find(traceKeys, line.key) == traceKeys.end()) {
      apply(settings, line.key, line.value);
    } else {
      trace += line.key + " " + line.value + " ";
    }
  }
  ASSERT_EQ(settings.call.empty(), trace.empty()) << "a call and its trace";
  if (!trace.empty()) {
    trace.pop_back();
    expectCall(trace, functions, settings, traceAll, c.place);
  }
}

} // namespace

LiveLocale::LiveLocale(uint32_t codepage, const char *name) {
  int32_t status = -1;
  object_ = NLS2_GetLocale(NLS2_LanguageIDFromShortPosixName(name, &status), codepage, 0, &status);
  EXPECT_EQ(status, 0) << name;
}

LiveLocale::~LiveLocale() { EXPECT_EQ(NLS2_ReleaseLocale(object_), 0); }

Words::Words(const std::string &call) {
  std::istringstream stream(call);
  std::string word;
  stream >> word;
  while (stream >> word) {
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

NLS2_Locale *Words::object(std::size_t i) const {
  static NLS2_Locale copy;
  const std::string &word = words_.at(i);
  if (word == "L0") {
    static NLS2_Locale unlisted{};
    name(&unlisted, "locale");
    return &unlisted;
  }
  if (word[0] == 'L') {
    return live_.at(word)->get();
  }
  if (word == "null" || word == "never") {
    return word == "null" ? nullptr : &never;
  }
  NLS2_Locale *node = pLocaleObjectList;
  for (char letter = word == "copy" ? 'A' : word[0]; letter > 'A'; --letter) {
    node = node->pNext;
  }
  copy = *node;
  return word == "copy" ? &copy : node;
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

void expectCases(const std::string &folder, const Functions &functions) {
  std::vector<std::string> keys = {"plain",         "untraced",     "call",   "or",
                                   "default",       "codepages",    "made",   "ucnv_open",
                                   "ucnv_getCCSID", "ucnv_getName", "malloc", "u_strToLower",
                                   "u_strFoldCase", "realloc"};
  keys.insert(keys.end(), traceKeys.begin(), traceKeys.end());
  for (const std::string &file : caseFiles(folder)) {
    for (const Case &c : readCases(file, keys)) {
      SCOPED_TRACE(c.place + ": " + c.why);
      expectCase(functions, c);
    }
  }
}

} // namespace support
