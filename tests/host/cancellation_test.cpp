// A thread that is cancelled while it writes a line leaves the trace stream to the others.

#include "trc1.h"

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <pthread.h>
#include <string>
#include <unistd.h>

namespace {

uint32_t syncWord = 1;
TRC1_EntryBlock anchor = {nullptr, "name", 4, 1, &syncWord, 0, 0, 0, {0, 0}};

void *traceCancelled(void *) {
  pthread_cancel(pthread_self());
  TRC1_Printf(&anchor, 2, "%s\n", "held back");
  pthread_testcancel();
  return nullptr;
}

} // namespace

TEST(Cancellation, LeavesTheTraceStreamUnlocked) {
  char path[] = "/tmp/zelhost_cancellation_XXXXXX";
  close(mkstemp(path));
  setenv("ZELHOST_TRACE", "all", 1);
  setenv("ZELHOST_TRACE_FILE", path, 1);
  alarm(30);          // a stream that stays locked would make the next call wait for ever
  TRC1_Sync(&anchor); // opens the file
  pthread_t thread{};
  ASSERT_EQ(pthread_create(&thread, nullptr, traceCancelled, nullptr), 0);
  void *result = nullptr;
  ASSERT_EQ(pthread_join(thread, &result), 0);
  EXPECT_EQ(result, PTHREAD_CANCELED);
  TRC1_Printf(&anchor, 3, "next\n");
  std::ifstream file(path);
  const std::string text{std::istreambuf_iterator<char>(file), {}};
  EXPECT_NE(text.find("name:2 held back\n"), std::string::npos) << text;
  EXPECT_NE(text.find("name:3 next\n"), std::string::npos) << text;
  std::remove(path);
}
