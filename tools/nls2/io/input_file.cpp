// Where a command reads from: a file or standard input.

#include "io/input_file.h"

#include "errors.h"

#include <array>
#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <fmt/core.h>
#include <poll.h>
#include <unistd.h>

namespace nls2::tool {

InputFile::InputFile(const std::string &path) : name_(path) {
  if (path == "-") {
    name_ = "standard input";
    fd_ = STDIN_FILENO;
    return;
  }
  fd_ = open(path.c_str(), O_RDONLY | O_CLOEXEC);
  if (fd_ < 0) {
    fail();
  }
}

InputFile::~InputFile() {
  if (fd_ >= 0 && fd_ != STDIN_FILENO) {
    close(fd_);
  }
}

void InputFile::fail() const { throw failure("cannot read {}: {}", name_, std::strerror(errno)); }

std::size_t InputFile::read(char *buffer, std::size_t length, int wakeFd) {
  for (;;) {
    std::array<pollfd, 2> watched{{{fd_, POLLIN, 0}, {wakeFd, POLLIN, 0}}};
    if (poll(watched.data(), watched.size(), -1) < 0 && errno != EINTR) {
      fail();
    }
    if ((watched[1].revents & POLLIN) != 0) {
      return 0;
    }
    const ssize_t got = watched[0].revents != 0 ? ::read(fd_, buffer, length) : -1;
    if (got >= 0) {
      return static_cast<std::size_t>(got);
    }
    if (watched[0].revents != 0 && errno != EINTR && errno != EAGAIN) {
      fail();
    }
  }
}

} // namespace nls2::tool
