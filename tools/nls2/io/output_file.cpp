// Where a command writes: standard output, a file that appears when it is complete, or a device.

#include "io/output_file.h"

#include "errors.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <fmt/core.h>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>

namespace nls2::tool {

namespace {

// The file that a path leads to, through symbolic links: a link stays a link when its file is
// replaced.
std::string realPathOf(const std::string &path) {
  const std::unique_ptr<char, decltype(&std::free)> resolved(realpath(path.c_str(), nullptr),
                                                             &std::free);
  if (!resolved) {
    throw failure("{}: {}", path, std::strerror(errno));
  }
  return resolved.get();
}

// Owner first, since a change of owner takes mode bits away. Only the superuser may do it for
// others' files; the mode then still holds.
void copyPermissions(const struct stat &from, int fd) {
  if (fchown(fd, from.st_uid, from.st_gid) != 0 && errno != EPERM) {
    throw failure("cannot keep the file's owner: {}", std::strerror(errno));
  }
  if (fchmod(fd, from.st_mode & 0777) != 0) {
    throw failure("cannot keep the file's permissions: {}", std::strerror(errno));
  }
}

} // namespace

OutputFile::OutputFile(const std::string &path) : name_(path) {
  if (path == "-") {
    name_ = "standard output";
    fd_ = STDOUT_FILENO;
    return;
  }
  replaceFile(path);
}

void OutputFile::replaceFile(const std::string &path) {
  struct stat existing = {};
  if (stat(path.c_str(), &existing) != 0) {
    if (lstat(path.c_str(), &existing) == 0) {
      throw failure("cannot write {}: it is a symbolic link that leads nowhere", path);
    }
    temporary_ = std::make_unique<TemporaryFile>(path);
    fd_ = temporary_->fd();
    return;
  }
  if (!S_ISREG(existing.st_mode)) {
    fd_ = open(path.c_str(), O_WRONLY | O_CLOEXEC);
    if (fd_ < 0) {
      fail();
    }
    return;
  }
  if (access(path.c_str(), W_OK) != 0) {
    fail();
  }
  temporary_ = std::make_unique<TemporaryFile>(realPathOf(path));
  fd_ = temporary_->fd();
  copyPermissions(existing, fd_);
}

OutputFile::~OutputFile() {
  if (!temporary_ && fd_ >= 0 && fd_ != STDOUT_FILENO) {
    close(fd_);
  }
}

void OutputFile::fail() const { throw failure("cannot write {}: {}", name_, std::strerror(errno)); }

void OutputFile::write(std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t written = ::write(fd_, bytes.data(), bytes.size());
    if (written >= 0) {
      bytes.remove_prefix(static_cast<std::size_t>(written));
    } else if (errno == EAGAIN) {
      pollfd writable{fd_, POLLOUT, 0};
      poll(&writable, 1, -1);
    } else if (errno != EINTR) {
      fail();
    }
  }
}

void OutputFile::commit() {
  if (temporary_) {
    temporary_->publish();
  }
}

} // namespace nls2::tool
