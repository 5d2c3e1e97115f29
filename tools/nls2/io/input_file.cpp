// Reads from a file or from standard input.

#include "io/input_file.h"

#include "base/errors.h"
#include "base/printable.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <limits>
#include <memory>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/stat.h>
#include <unistd.h>

namespace nls2::tool {

InputFile::InputFile(const std::string &path)
    : name_(shownName(path, "standard input")),
      fd_(path == "-" ? STDIN_FILENO : open(path.c_str(), O_RDONLY | O_CLOEXEC)),
      wakeFd_(fd_ < 0 ? -1 : eventfd(0, EFD_CLOEXEC)) {
  if (wakeFd_ < 0) {
    fail();
  }
}

InputFile::~InputFile() {
  close(wakeFd_);
  if (fd_ != STDIN_FILENO) {
    close(fd_);
  }
}

void InputFile::interrupt() const { eventfd_write(wakeFd_, 1); }

void InputFile::fail() const { throw failure("cannot read {}: {}", name_, std::strerror(errno)); }

std::size_t InputFile::read(char *buffer, std::size_t length) {
  for (;;) {
    std::array<pollfd, 2> watched{{{fd_, POLLIN, 0}, {wakeFd_, POLLIN, 0}}};
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

// Terminals and other devices accept a seek but ignore it, so only regular files are sought.
void InputFile::skip(uint64_t bytes) {
  constexpr uint64_t farthest = std::numeric_limits<off_t>::max();
  if (const auto left = bytesLeft()) {
    const uint64_t sought = std::min({bytes, *left, farthest});
    if (lseek(fd_, static_cast<off_t>(sought), SEEK_CUR) < 0) {
      fail();
    }
    bytes -= sought; // files in /proc are longer than their size
  }
  constexpr std::size_t chunk = std::size_t{64} * 1024;
  const auto dropped = std::make_unique_for_overwrite<char[]>(chunk);
  while (bytes > 0) {
    const std::size_t got = read(dropped.get(), std::min<uint64_t>(bytes, chunk));
    if (got == 0) {
      return;
    }
    bytes -= got;
  }
}

struct stat InputFile::facts() const {
  struct stat facts = {};
  static_cast<void>(fstat(fd_, &facts));
  return facts;
}

std::optional<uint64_t> InputFile::bytesLeft() const {
  const struct stat file = facts();
  const off_t here = S_ISREG(file.st_mode) ? lseek(fd_, 0, SEEK_CUR) : -1;
  return here < 0 ? std::nullopt
                  : std::optional(static_cast<uint64_t>(std::max<off_t>(file.st_size - here, 0)));
}

} // namespace nls2::tool
