// What a thread remembers of the registry, so that most validations need not search the list.
//
// A thread remembers where it last found some objects: the link that held each of them, the head of
// the list or the pNext of the object before. An object is live if such a link still holds it, as
// long as nothing was removed since and the head is the same:
//   - A removal counts after it unlinks, and before it waits for walks and frees. So a glance that
//     reads the old count is waited for before any object that has a remembered link is freed.
//   - The count is read before the search. Read later, it could include the removal of the very
//     object that the search had just found.
//   - The link is read again because the list is exported: a program may take an object off it. The
//     head is compared for the same reason: under another head, the link may be on no list.
// A validation during a removal may find the object or not, with or without a search.
//
// A removal pays for the glances that it must expect. So a thread remembers nothing until its
// searches since the last removal have taken some time themselves: where objects come and go all
// the time, it does not get that far.
//
// A signal handler may validate at any time: it trusts nothing that it interrupted half written,
// and does not write it.
#pragma once

#include "locale/walkers.h"
#include "nls2.h"

#include <atomic>
#include <cstddef>
#include <cstdint>

namespace nls2::locale {

using Link = NLS2_Locale *const *;

// Of one thread; atomic only for that thread's signal handlers.
struct Remembered {
  std::atomic<std::size_t> removals; // 0, which is never the count: do not trust the rest
  std::atomic<const NLS2_Locale *> head;
  std::atomic<Link> links[16];         // none is null once the count was set
  std::atomic<std::size_t> searchedAt; // the count at the last search
  std::atomic<std::size_t> followed;   // links, in all searches at that count
  std::atomic<bool> writing;
};

extern constinit std::atomic<std::size_t> removalCount;
extern constinit thread_local Remembered remembered __attribute__((tls_model("initial-exec")));

// Reads a link of the list, with or without the lock. Links and the counts of walkers.h are
// sequentially consistent, so that a removal sees every walk that can still see the removed object.
// Such a load costs nothing on x86 and little elsewhere.
inline NLS2_Locale *follow(NLS2_Locale *const &link) {
  return __atomic_load_n(&link, __ATOMIC_SEQ_CST);
}

// An object has four places, a group of the sixteen. The heap lays objects that are made in a row
// 160 bytes apart; this gives each its own first place.
constexpr unsigned placesOfObject = 4;
inline std::size_t firstPlace(const NLS2_Locale *object) {
  return reinterpret_cast<std::uintptr_t>(object) / 32 % 16;
}

// Call in a walk, which found the object at this link after so many. The count and the head are
// from before the search.
void remember(const NLS2_Locale *object, Link link, std::size_t linksFollowed, std::size_t removals,
              const NLS2_Locale *head);

inline bool isRemembered(const NLS2_Locale *object) {
  const Remembered &own = remembered;
  const Glance glance;
  if (object == nullptr || // what the last link holds
      removalCount.load(std::memory_order_seq_cst) !=
          own.removals.load(std::memory_order_relaxed) ||
      follow(pLocaleObjectList) != own.head.load(std::memory_order_relaxed)) {
    return false;
  }
  const std::size_t first = firstPlace(object);
  for (std::size_t i = 0; i < placesOfObject; ++i) {
    if (follow(*own.links[first ^ i].load(std::memory_order_relaxed)) == object) {
      return true;
    }
  }
  return false;
}

} // namespace nls2::locale
