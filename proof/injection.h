// Makes the nth request to the heap, or the nth call of ICU that can fail, fail. Linking it into a
// program puts its functions before libc's and ICU's.
#pragma once

namespace proof {

enum class Fault { none, heap, icu };

const char *nameOf(Fault fault);

// The `at`th from now on fails, once. Whether the one before it was reached.
bool failAt(Fault fault, long at);

// Blocks that libzelnls2 itself asked for and did not free, and ICU handles it opened and did not
// close.
struct Left {
  long blocks = 0;
  long handles = 0;
  friend bool operator==(const Left &, const Left &) = default;
};
Left left();

// Whether the last process that crashed did so in ICU's own code.
bool crashIsIcus();

} // namespace proof
