// Calls under given answers of ICU's.

#include "locale/scenario.h"

#include "support/icu_probe.h"
#include "support/known_trace.h"

#include <algorithm>
#include <cstdio>
#include <gtest/gtest.h>

namespace support {

namespace {

std::string lettered(const Names &names, const NLS2_Locale *object) {
  const auto found = std::find_if(names.begin(), names.end(),
                                  [=](const auto &pair) { return pair.first == object; });
  return found != names.end() ? found->second : "";
}

// Gives the next letters to those live objects that have none yet, and describes all.
std::string listed(Names &names) {
  std::string text;
  for (const NLS2_Locale *node = pLocaleObjectList; node != nullptr; node = node->pNext) {
    if (lettered(names, node).empty()) {
      names.emplace_back(node, std::string(1, static_cast<char>('A' + names.size() - 2)));
    }
    text += (text.empty() ? "" : " ") + said(lettered(names, node), described(*node));
  }
  return text;
}

} // namespace

NLS2_Locale never = {0x03480001, 1208, "en_US", nullptr};

NLS2_Locale *live(int nth) {
  NLS2_Locale *node = pLocaleObjectList;
  for (; nth > 0; --nth) {
    node = node->pNext;
  }
  return node;
}

std::string described(const NLS2_Locale &object) {
  char numbers[32];
  std::snprintf(numbers, sizeof numbers, " %08X %u", object.languageId, object.codepage);
  return object.icuLocale + std::string(numbers);
}

void expectScenario(const Scenario &scenario) {
  SCOPED_TRACE(scenario.name);
  const Answering answering(scenario.answers);
  for (int i = 0; i < scenario.made; ++i) {
    int32_t status = -1;
    NLS2_allocateLocale(&status);
    EXPECT_EQ(status, 0);
  }
  Names names = {{&LocaleObjectList_Lock, "list lock"}, {&never, "never"}};
  listed(names);
  {
    const ConverterMarks marks;
    const Recording recording(scenario.trace == traced ? traceAll : traceOff);
    EXPECT_EQ(scenario.call(), scenario.answer);
    EXPECT_EQ(listed(names), scenario.left);
    if (scenario.trace == traced) {
      expectKnownTrace(scenario.name, recording, names);
    }
  }
  while (pLocaleObjectList != nullptr) {
    ASSERT_EQ(NLS2_ReleaseLocale(pLocaleObjectList), 0);
  }
}

} // namespace support
