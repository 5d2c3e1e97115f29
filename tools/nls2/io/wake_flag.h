// A flag that ends a wait for input.
#pragma once

#include "errors.h"

#include <sys/eventfd.h>
#include <unistd.h>

namespace nls2::tool {

// Its descriptor becomes readable for good when it is raised.
class WakeFlag {
public:
  WakeFlag() : fd_(eventfd(0, EFD_CLOEXEC)) {
    if (fd_ < 0) {
      throw failure("cannot make an event descriptor");
    }
  }
  ~WakeFlag() { close(fd_); }
  WakeFlag(const WakeFlag &) = delete;
  WakeFlag &operator=(const WakeFlag &) = delete;

  int fd() const { return fd_; }
  void raise() const { eventfd_write(fd_, 1); }

private:
  const int fd_;
};

} // namespace nls2::tool
