// What a thread remembers of the registry: writing it down.

#include "locale/remembered.h"

namespace nls2::locale {

constinit std::atomic<std::size_t> removalCount{1};
constinit thread_local Remembered remembered __attribute__((tls_model("initial-exec"))) = {};

namespace {

// In the order of the program, as far as the thread's signal handlers can see.
template <class Value>
void put(std::atomic<Value> &field, Value value) {
  field.store(value, std::memory_order_relaxed);
  std::atomic_signal_fence(std::memory_order_seq_cst);
}

void write(Remembered &own, const NLS2_Locale *object, std::size_t removals,
           const NLS2_Locale *head) {
  const bool upToDate = own.removals == removals && own.head == head;
  put(own.removals, std::size_t{0});
  if (!upToDate) {
    put(own.head, head);
    for (auto &place : own.objects) {
      put<const NLS2_Locale *>(place, nullptr);
    }
  }
  std::size_t place = firstPlace(object);
  for (std::size_t i = 1; i < placesOfObject && own.objects[place] != nullptr; ++i) {
    place = firstPlace(object) ^ i;
  }
  put(own.objects[place], object);
  put(own.removals, removals);
}

} // namespace

void remember(const NLS2_Locale *object, std::size_t removals, const NLS2_Locale *head) {
  Remembered &own = remembered;
  if (own.writing) {
    return;
  }
  put(own.writing, true);
  write(own, object, removals, head);
  put(own.writing, false);
}

} // namespace nls2::locale
