// What a thread remembers of the registry: writing it down.

#include "locale/remembered.h"

namespace nls2::locale {

constinit std::atomic<std::size_t> removalCount{1};
constinit thread_local Remembered remembered __attribute__((tls_model("initial-exec"))) = {};

namespace {

// An unused place holds the link that is always there.
constexpr Link unused = &pLocaleObjectList;

// In the order of the program, as far as the thread's signal handlers can see.
template <class Value>
void put(std::atomic<Value> &field, Value value) {
  field.store(value, std::memory_order_relaxed);
  std::atomic_signal_fence(std::memory_order_seq_cst);
}

void write(Remembered &own, const NLS2_Locale *object, Link link, std::size_t removals,
           const NLS2_Locale *head) {
  const bool upToDate = own.removals == removals && own.head == head;
  put(own.removals, std::size_t{0});
  if (!upToDate) {
    put(own.head, head);
    for (std::atomic<Link> &place : own.links) {
      put(place, unused);
    }
  }
  std::size_t place = firstPlace(object);
  for (std::size_t i = 1; i < placesOfObject && own.links[place] != unused; ++i) {
    place = firstPlace(object) ^ i;
  }
  put(own.links[place], link);
  expectGlances();
  put(own.removals, removals);
}

} // namespace

void remember(const NLS2_Locale *object, Link link, std::size_t linksFollowed, std::size_t removals,
              const NLS2_Locale *head) {
  constexpr std::size_t worthAGlance = 32;
  Remembered &own = remembered;
  if (own.writing) {
    return;
  }
  put(own.writing, true);
  const std::size_t before = own.searchedAt == removals ? own.followed.load() : 0;
  put(own.followed, before + linksFollowed);
  put(own.searchedAt, removals);
  if (own.followed >= worthAGlance) {
    write(own, object, link, removals, head);
  }
  put(own.writing, false);
}

} // namespace nls2::locale
