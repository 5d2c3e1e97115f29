// The registry of live locale objects, and the list's exported head and lock.

#include "locale/registry.h"

#include "locale/walkers.h"
#include "sys1.h"

#include <cstddef>
#include <cstdlib>
#include <pthread.h>

static_assert(sizeof(NLS2_Locale) == 144 + sizeof(void *));
static_assert(offsetof(NLS2_Locale, codepage) == 4);
static_assert(offsetof(NLS2_Locale, icuLocale) == 8);
static_assert(offsetof(NLS2_Locale, pNext) == 144);
static_assert(sizeof(LocaleObjectList_Lock) == SYS1_LOCK_SIZE);

NLS2_Locale *pLocaleObjectList = nullptr;
uint32_t LocaleObjectList_Lock[7] = {};

namespace nls2::locale {

namespace {

// 0 is never the count.
void countRemoval() {
  const std::size_t next = removalCount.load(std::memory_order_relaxed) + 1;
  removalCount.store(next != 0 ? next : 1, std::memory_order_seq_cst);
}

// Changes a link; see `follow`.
void set(NLS2_Locale *&link, NLS2_Locale *object) {
  __atomic_store_n(&link, object, __ATOMIC_SEQ_CST);
}

// What a thread knows about the lock when it forks, perhaps in a signal handler.
struct Forking {
  bool changesList; // the thread holds the lock, or waits for it
  bool tookLock;
  int cancelState;
};
constinit thread_local Forking forking __attribute__((tls_model("initial-exec"))) = {};
static_assert(sizeof remembered + sizeof(detail::Counts *) + sizeof forking <= 256);

// If another thread held the lock during the fork, nobody would release it in the child. So the
// forking thread takes it first, unless it forks in a signal handler that interrupted a change of
// the list, which may hold the lock, or a walk, for which the holder may be waiting.
void beforeFork() {
  pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &forking.cancelState);
  forking.tookLock = !forking.changesList && !isWalking();
  if (forking.tookLock) {
    SYS1_GetLock(&LocaleObjectList_Lock);
  }
}

void afterFork() {
  if (forking.tookLock) {
    SYS1_ReleaseLock(&LocaleObjectList_Lock);
  }
  pthread_setcancelstate(forking.cancelState, nullptr);
}

void afterForkInChild() {
  forgetOtherWalks();
  afterFork();
}

__attribute__((constructor)) void watchForks() {
  pthread_atfork(beforeFork, afterFork, afterForkInChild);
}

// Holds the list's lock, with thread cancellation disabled: a host's trace call may be a
// cancellation point, and a cancelled thread runs no destructor of this library, which is built
// without exceptions. The lock would never be released.
class ListLock {
public:
  ListLock() {
    pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &cancelState_);
    forking.changesList = true;
    SYS1_GetLock(&LocaleObjectList_Lock);
  }
  ~ListLock() {
    SYS1_ReleaseLock(&LocaleObjectList_Lock);
    forking.changesList = false;
    pthread_setcancelstate(cancelState_, nullptr);
  }
  ListLock(const ListLock &) = delete;
  ListLock &operator=(const ListLock &) = delete;

private:
  int cancelState_ = 0;
};

void link(trace::Trace trace, NLS2_Locale *object) {
  NLS2_Locale *last = follow(pLocaleObjectList);
  if (last == nullptr) {
    NLS2_TRACE(trace, "List is empty, add as first node.");
    set(pLocaleObjectList, object);
    return;
  }
  NLS2_TRACE(trace, "List has entries, Attach to end of list.");
  while (NLS2_Locale *following = follow(last->pNext)) {
    last = following;
  }
  set(last->pNext, object);
}

// Where an object is on the list: `current` is the object, or null at the list's end.
struct Position {
  NLS2_Locale *previous;
  NLS2_Locale *current;
};

Position locate(trace::Trace trace, NLS2_Locale *head, const NLS2_Locale *object) {
  NLS2_TRACE(trace, "Locate %X on linked-list", trace::low32(object));
  Position at{head, head};
  while (at.current != nullptr && at.current != object) {
    at.previous = at.current;
    at.current = follow(at.current->pNext);
    NLS2_TRACE(trace, "Set the following: Previous %X,  Current %X,  Next %X.",
               trace::low32(at.previous), trace::low32(at.current),
               trace::low32(at.current != nullptr ? follow(at.current->pNext) : nullptr));
  }
  return at;
}

// The removed object keeps its own link, for walks that have reached it.
void unlink(trace::Trace trace, Position at) {
  NLS2_Locale *following = follow(at.current->pNext);
  if (at.current == follow(pLocaleObjectList)) {
    NLS2_TRACE(trace, "Head of link-list.");
    set(pLocaleObjectList, following);
    return;
  }
  NLS2_TRACE(trace, "Is this the end of the linked-list?");
  if (following != nullptr) {
    NLS2_TRACE(trace, "No, Remove this locale from middle.");
  } else {
    NLS2_TRACE(trace, "Yes. Remove this locale from end.");
  }
  NLS2_TRACE(trace, "pPrevious->pNext = %X.", trace::low32(following));
  set(at.previous->pNext, following);
}

} // namespace

bool contains(const NLS2_Locale *object) {
  if (object == nullptr) {
    return false;
  }
  const std::size_t removals = removalCount.load(std::memory_order_seq_cst);
  const Walk walk;
  NLS2_Locale *const *link = &pLocaleObjectList;
  const NLS2_Locale *const head = follow(*link);
  const NLS2_Locale *node = head;
  std::size_t linksFollowed = 1;
  while (node != nullptr && node != object) {
    link = &node->pNext;
    node = follow(*link);
    ++linksFollowed;
  }
  if (node != nullptr) {
    remember(object, link, linksFollowed, removals, head);
  }
  return node != nullptr;
}

int32_t validateInFrame(TRC1_EntryBlock &anchor, const NLS2_Locale *pLocale) {
  trace::Frame frame(anchor);
  if (!contains(pLocale)) {
    NLS2_TRACE(frame, "Could not find locale on linked-list.");
    return frame.result(int32_t{NLS2_ERR_INVALID_LOCALE});
  }
  NLS2_TRACE(frame, "Locale successfully found on linked-list.");
  return frame.result(0);
}

void append(trace::Trace trace, NLS2_Locale *object) {
  NLS2_TRACE(trace, "Place locale object on linked list.");
  NLS2_TRACE(trace, "Acquire lock on linked-list.");
  const ListLock lock;
  link(trace, object);
  NLS2_TRACE(trace, "Linked-list modification complete, release lock.");
}

void remove(trace::Trace trace, NLS2_Locale *object) {
  NLS2_TRACE(trace, "Acquire lock on linked-list.");
  const ListLock lock;
  if (NLS2_Locale *head = follow(pLocaleObjectList)) {
    NLS2_TRACE(trace, "Linked-list has entries");
    if (const Position at = locate(trace, head, object); at.current != nullptr) {
      unlink(trace, at);
      countRemoval();
      NLS2_TRACE(trace, "Locale structure removed from list.");
      if (waitForWalkers()) {
        std::free(at.current);
      }
    }
  }
  NLS2_TRACE(trace, "Release lock on linked-list.");
}

} // namespace nls2::locale
