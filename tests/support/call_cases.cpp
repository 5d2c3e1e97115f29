// Runs the calls of case files.

#include "support/call_cases.h"

#include "support/case_file.h"
#include "support/probe.h"
#include "support/recording_host.h"
#include "support/words.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <optional>
#include <sstream>

namespace support {

namespace {

const std::vector<std::string> traceKeys = {"|", "dump", "calls", "host", "=", "..."};

struct Settings {
  World world;
  int made = 0;
  std::string call;
};

void apply(Settings &settings, const std::string &key, const std::string &value) {
  std::istringstream words(value);
  if (key == "default") {
    settings.world.locale = value == "''" ? "" : CaseLine{key, value, value}.bytes();
  } else if (key == "codepages") {
    settings.world.codepages = split(value, ',');
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

// A sanitizer's heap cannot fail and is not counted, so such cases are left out.
bool canHappen(const Settings &settings, const std::string &expected) {
  return interpose::heapIsOurs ||
         (expected.find("blocks left") == expected.npos &&
          std::ranges::none_of(settings.world.faults, [](const Fault &fault) {
            return fault.function.find("alloc") != std::string::npos;
          }));
}

// Gives letters to live objects without a name, and describes all objects that have letters.
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

// What the library holds, not counting the objects on its list.
interpose::Held heldNow() {
  interpose::Held held = interpose::held();
  for (const NLS2_Locale *node = pLocaleObjectList; node != nullptr; node = node->pNext) {
    --held.blocks;
  }
  return held;
}

std::string leftBehind(const interpose::Held &before) {
  const interpose::Held now = heldNow();
  std::string text;
  if (now.handles != before.handles) {
    text += ", handles left " + shown(now.handles - before.handles);
  }
  if (interpose::heapIsOurs && now.blocks != before.blocks) {
    text += ", blocks left " + shown(now.blocks - before.blocks);
  }
  return text;
}

// The trace of `function` as a case shows it, with calls of other functions folded.
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

// The lines joined by blanks, with the answer at the end.
std::string joined(std::vector<std::string> lines, std::string answer) {
  if (!lines.empty()) {
    const bool isValue = "= " + answer.substr(0, answer.find(',')) == lines.back();
    answer = isValue ? "= " + answer : lines.back() + ", " + answer;
    lines.pop_back();
  }
  std::string text;
  for (const std::string &line : lines) {
    text += line + " ";
  }
  return text + answer;
}

// Shows 16 or more equal characters as case files do: \*64x.
std::string shortened(const std::string &text) {
  std::string result;
  for (std::size_t at = 0; at < text.size();) {
    const std::size_t end = std::min(text.find_first_not_of(text[at], at), text.size());
    const std::string once(1, text[at]);
    result += end - at < 16 ? text.substr(at, end - at) : "\\*" + shown(end - at) + once;
    at = end;
  }
  return result;
}

std::string run(const Settings &settings, uint32_t flags) {
  world = {};
  for (int i = 0; i < settings.made; ++i) {
    int32_t status = 0;
    NLS2_allocateLocale(&status);
  }
  std::string trace;
  {
    const Words words(settings.call);
    listed(words.names());
    const std::string function = settings.call.substr(0, settings.call.find(' '));
    const interpose::Held before = heldNow();
    openedHandles();
    std::string answer;
    std::vector<std::string> lines;
    {
      const Recording recording(flags);
      world = settings.world;
      answer = functions().at(function)(words);
      world = {};
      lines = folded(function, recording.lines());
    }
    trace = joined(flags == traceAll ? lines : std::vector<std::string>(), answer);
    trace += leftBehind(before) + listed(words.names());
    for (const void *handle : openedHandles()) {
      words.name(handle, "converter");
    }
    trace = shortened(named(trace, words.names()));
  }
  while (pLocaleObjectList != nullptr && NLS2_ReleaseLocale(pLocaleObjectList) == 0) {
  }
  return trace;
}

// One item per line, for messages.
std::string broken(std::string text) {
  for (const std::string start : {" | ", " calls ", " host ", " dump "}) {
    for (std::size_t at = 0; (at = text.find(start, at)) != text.npos;) {
      text[at] = '\n';
    }
  }
  return text;
}

void expectCall(const std::string &expected, const Settings &settings, uint32_t flags,
                const std::string &place) {
  if (!canHappen(settings, expected)) {
    return;
  }
  [[maybe_unused]] std::optional<MeantLeak> leak;
  if (expected.find(" left ") != expected.npos) {
    leak.emplace();
  }
  std::string actual = run(settings, flags);
  const std::string gap = "... ";
  const std::size_t at = expected.find(gap + "| ");
  if (at != expected.npos && actual.size() + gap.size() > expected.size()) {
    actual.replace(at, actual.size() + gap.size() - expected.size(), gap);
  }
  EXPECT_EQ(broken(expected), broken(actual)) << place;
}

void expectPlain(Settings settings, const CaseLine &line) {
  const auto [call, answer] = line.split(" -> ");
  settings.call = call;
  expectCall(answer.value, settings, traceOff, line.place);
  if (line.key == "plain") {
    expectCall(answer.value, settings, traceDetail, line.place);
  }
}

void expectOther(Settings settings, const CaseLine &line, const std::string &before) {
  const auto [setting, rest] = line.split(": ");
  const auto [key, value] = CaseLine{line.key, setting, line.place}.split(" ");
  apply(settings, key, value.value);
  expectCall(before + rest.value, settings, traceAll, line.place);
}

void expectCase(const Case &c) {
  Settings settings;
  std::string trace; // each line ends with a blank
  for (const CaseLine &line : c.lines) {
    if (line.key == "plain" || line.key == "untraced") {
      expectPlain(settings, line);
    } else if (line.key == "or") {
      expectOther(settings, line, trace);
    } else if (std::ranges::find(traceKeys, line.key) == traceKeys.end()) {
      apply(settings, line.key, line.value);
    } else {
      trace += line.key + " " + line.value + " ";
    }
  }
  ASSERT_EQ(settings.call.empty(), trace.empty()) << "a call and its trace";
  if (!trace.empty()) {
    trace.pop_back();
    expectCall(trace, settings, traceAll, c.place);
  }
}

} // namespace

void expectCases(const std::string &file) {
  std::vector<std::string> keys = {"plain",        "untraced",  "call",         "or",
                                   "default",      "codepages", "made",         "malloc",
                                   "calloc",       "realloc",   "ucnv_open",    "ucnv_getCCSID",
                                   "ucnv_getName", "u_init",    "u_strToLower", "u_strFoldCase"};
  keys.insert(keys.end(), traceKeys.begin(), traceKeys.end());
  for (const Case &c : readCases(file, keys)) {
    SCOPED_TRACE(c.place + ": " + c.why);
    expectCase(c);
  }
}

} // namespace support
