// Locale objects: put on the list, validated, released.

#include "nls2.h"
#include "support/default_probe.h"
#include "support/recording_host.h"
#include "support/trace_outline.h"
#include "sys1.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <thread>

namespace {

using support::Answers;
using support::outline;
using support::Recording;
using support::traceAll;

NLS2_Locale *make() {
  int32_t status = -1;
  NLS2_Locale *object = NLS2_allocateLocale(&status);
  EXPECT_EQ(status, 0);
  return object;
}

TEST(AllocateLocale, TracesItsWayOntoTheList) {
  const Answers answers;
  const auto allocated = [](const std::string &place) {
    return "> NLS2_allocateLocale\n"
           ": Preparing to initialize Locale structure.\n"
           "NLS2_initLocaleObject = 0\n"
           ": Place locale object on linked list.\n"
           ": Acquire lock on linked-list.\n"
           "lock\n" +
           place +
           ": Linked-list modification complete, release lock.\n"
           "unlock\n"
           ": Locale object {new} allocated and initialized.\n"
           "= {new}\n";
  };
  NLS2_Locale *objects[3];
  for (NLS2_Locale *&object : objects) {
    const Recording recording(traceAll);
    object = make();
    EXPECT_EQ(outline(recording, {{object, "new"}}),
              allocated(&object == objects ? ": List is empty, add as first node.\n"
                                           : ": List has entries, Attach to end of list.\n"));
  }
  EXPECT_EQ(pLocaleObjectList, objects[0]);
  EXPECT_EQ(objects[0]->pNext, objects[1]);
  EXPECT_EQ(objects[1]->pNext, objects[2]);
  EXPECT_EQ(objects[2]->pNext, nullptr);
  for (NLS2_Locale *object : objects) {
    EXPECT_EQ(NLS2_ReleaseLocale(object), 0);
  }
}

TEST(AllocateLocale, FailuresLeaveNothingBehind) {
  for (const bool noMemory : {true, false}) {
    if (noMemory && !support::objectsCanFail) {
      continue;
    }
    Answers answers;
    answers.locale = "en";
    answers.noObjects = noMemory;
    const Recording recording(traceAll);
    int32_t status = -1;
    EXPECT_EQ(NLS2_allocateLocale(&status), nullptr);
    EXPECT_EQ(status, noMemory ? 32 : 37);
    EXPECT_EQ(pLocaleObjectList, nullptr);
    EXPECT_EQ(outline(recording), noMemory ? "> NLS2_allocateLocale\n"
                                             ": Error allocating memory\n"
                                             "=\n"
                                           : "> NLS2_allocateLocale\n"
                                             ": Preparing to initialize Locale structure.\n"
                                             "NLS2_initLocaleObject = 37\n"
                                             ": Error initializing locale object 37\n"
                                             "=\n");
  }
}

TEST(ValidateLocale, ComparesPointers) {
  const Answers answers;
  NLS2_Locale *const live = make();
  const NLS2_Locale copy = *live;
  const struct {
    const char *reason;
    const NLS2_Locale *pointer;
    std::string trace;
  } rows[] = {
      {"live", live, ": Locale successfully found on linked-list.\n= 0\n"},
      {"a copy", &copy, ": Could not find locale on linked-list.\n= 38\n"},
      {"null", nullptr, ": Could not find locale on linked-list.\n= 38\n"},
  };
  for (const auto &row : rows) {
    const unsigned locksBefore = support::lockCalls();
    const Recording recording(traceAll);
    EXPECT_EQ(NLS2_ValidateLocale(row.pointer), row.pointer == live ? 0 : 38) << row.reason;
    EXPECT_EQ(outline(recording), "> NLS2_ValidateLocale\n" + row.trace) << row.reason;
    EXPECT_EQ(support::lockCalls(), locksBefore) << "it takes no lock";
  }
  EXPECT_EQ(NLS2_ReleaseLocale(live), 0);
}

// The live objects by their names in `names`.
std::string listed(const support::Names &names) {
  std::string text;
  for (const NLS2_Locale *node = pLocaleObjectList; node != nullptr; node = node->pNext) {
    text += std::find_if(names.begin(), names.end(), [=](auto &pair) {
              return pair.first == node;
            })->second;
  }
  return text;
}

TEST(ReleaseLocale, TracesItsWayAlongTheList) {
  const Answers answers;
  const struct {
    const char *reason;
    int objects;
    int released;
    const char *left;
    const char *steps;
  } rows[] = {
      {"the only one", 1, 0, "", ": Head of link-list.\n"},
      {"the head", 3, 0, "BC", ": Head of link-list.\n"},
      {"from the middle", 3, 1, "AC",
       ": Set the following: Previous {A},  Current {B},  Next {C}.\n"
       ": Is this the end of the linked-list?\n"
       ": No, Remove this locale from middle.\n"
       ": pPrevious->pNext = {C}.\n"},
      {"from the end", 3, 2, "AB",
       ": Set the following: Previous {A},  Current {B},  Next {C}.\n"
       ": Set the following: Previous {B},  Current {C},  Next 0.\n"
       ": Is this the end of the linked-list?\n"
       ": Yes. Remove this locale from end.\n"
       ": pPrevious->pNext = 0.\n"},
  };
  const std::string start = "> NLS2_ReleaseLocale\n"
                            ": Input parameter: pNLS2_Locale @.\n"
                            ": Releasing Locale object @.\n"
                            "NLS2_ValidateLocale = 0\n"
                            ": Acquire lock on linked-list.\n"
                            "lock\n"
                            ": Linked-list has entries\n"
                            ": Locate @ on linked-list\n";
  const std::string end = ": Locale structure removed from list.\n"
                          ": Release lock on linked-list.\n"
                          "unlock\n"
                          "= 0\n";
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    support::Names names;
    std::vector<NLS2_Locale *> objects;
    for (int i = 0; i < row.objects; ++i) {
      objects.push_back(make());
      names.emplace_back(objects.back(), std::string(1, static_cast<char>('A' + i)));
    }
    NLS2_Locale *const released = objects[static_cast<size_t>(row.released)];
    const std::string name = "{" + names[static_cast<size_t>(row.released)].second + "}";
    {
      const Recording recording(traceAll);
      EXPECT_EQ(NLS2_ReleaseLocale(released), 0);
      EXPECT_EQ(outline(recording, names), support::filled(start, "@", name) + row.steps + end);
    }
    EXPECT_EQ(listed(names), row.left);
    EXPECT_EQ(NLS2_ReleaseLocale(released), 37) << "twice";
    EXPECT_EQ(listed(names), row.left);
    while (pLocaleObjectList != nullptr) {
      EXPECT_EQ(NLS2_ReleaseLocale(pLocaleObjectList), 0);
    }
  }
}

TEST(ReleaseLocale, RefusesWhatIsNotLive) {
  NLS2_Locale never = {};
  for (NLS2_Locale *const pointer : {&never, static_cast<NLS2_Locale *>(nullptr)}) {
    const std::string shown = pointer != nullptr ? "{X}" : "0";
    const Recording recording(traceAll);
    EXPECT_EQ(NLS2_ReleaseLocale(pointer), 37);
    EXPECT_EQ(outline(recording, {{&never, "X"}}),
              support::filled("> NLS2_ReleaseLocale\n"
                              ": Input parameter: pNLS2_Locale @.\n"
                              ": Releasing Locale object @.\n"
                              "NLS2_ValidateLocale = 38\n"
                              ": Invalid locale specified.\n"
                              "= 37\n",
                              "@", shown));
  }
}

// Both threads have found the object valid before either gets the lock.
TEST(ReleaseLocale, FindsTheObjectGoneWhenAnotherThreadWasFaster) {
  const Answers answers;
  for (const bool behindAnother : {false, true}) {
    NLS2_Locale *const before = behindAnother ? make() : nullptr;
    NLS2_Locale *const shared = make();
    SYS1_GetLock(&LocaleObjectList_Lock);
    const Recording recording(traceAll);
    int32_t results[2] = {-1, -1};
    std::thread first([&] { results[0] = NLS2_ReleaseLocale(shared); });
    std::thread second([&] { results[1] = NLS2_ReleaseLocale(shared); });
    const auto times = [&](const std::string &text) {
      const auto lines = recording.details("NLS2_ReleaseLocale");
      return std::count(lines.begin(), lines.end(), text);
    };
    while (times("Acquire lock on linked-list.") < 2) {
      std::this_thread::yield();
    }
    SYS1_ReleaseLock(&LocaleObjectList_Lock);
    first.join();
    second.join();
    EXPECT_EQ(results[0], 0);
    EXPECT_EQ(results[1], 0);
    EXPECT_EQ(times("Locale structure removed from list."), 1);
    EXPECT_EQ(times("Linked-list has entries"), behindAnother ? 2 : 1);
    EXPECT_EQ(times("Release lock on linked-list."), 2);
    EXPECT_EQ(pLocaleObjectList, before);
    EXPECT_EQ(NLS2_ReleaseLocale(before), behindAnother ? 0 : 37);
  }
}

} // namespace
