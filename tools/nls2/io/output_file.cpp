// Where a command writes: standard output, a file that appears when it is complete, or a device.

#include "io/output_file.h"

#include "errors.h"
#include "io/file_attributes.h"
#include "memory.h"

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <climits>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <optional>
#include <poll.h>
#include <unistd.h>

namespace nls2::tool {

namespace {

constexpr std::size_t mostKept = std::size_t{64} * 1024;

std::string resolved(const std::string &path) {
  const std::unique_ptr<char, decltype(&std::free)> real(realpath(path.c_str(), nullptr),
                                                         &std::free);
  return real ? real.get() : "";
}

// The file that a path leads to, through symbolic links: a link stays a link when its file is
// replaced.
std::string realPathOf(const std::string &path) {
  std::string real = resolved(path);
  if (real.empty()) {
    throw failure("cannot write {}: {}", printable(path), std::strerror(errno));
  }
  return real;
}

std::optional<int> numberIn(const std::string &text) {
  int number = -1;
  const char *end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, number);
  return error == std::errc() && stop == end ? std::optional(number) : std::nullopt;
}

// Where a symbolic link leads; empty for everything else.
std::string targetOf(const std::string &path) {
  std::string target(PATH_MAX, '\0');
  const ssize_t length = readlink(path.c_str(), target.data(), target.size());
  target.resize(static_cast<std::size_t>(std::max<ssize_t>(length, 0)));
  return target;
}

// The number in /proc/self/fd/NUMBER, to which /dev/stdout, /dev/fd/NUMBER and links of users lead.
// What lies behind that number is not looked at.
std::optional<int> descriptorOf(std::string path) {
  const std::string ours = "/proc/" + std::to_string(getpid()) + "/";
  for (int links = 0; links < 40; ++links) {
    const std::size_t name = path.rfind('/') + 1; // 0 without a slash
    const std::string directory = name == 0 ? "./" : path.substr(0, name);
    const std::string real = resolved(directory);
    if (real.starts_with(ours) && real.ends_with("/fd")) {
      return numberIn(path.substr(name));
    }
    const std::string target = targetOf(path);
    if (target.empty()) {
      return {};
    }
    path = target.starts_with("/") ? target : directory + target;
  }
  return {};
}

// In a directory such as /tmp only the owner of a file, or of the directory, may replace it.
bool isOthersInStickyDirectory(const std::string &path, const struct stat &existing) {
  struct stat directory = {};
  const std::string parent = path.substr(0, path.rfind('/') + 1);
  return stat(parent.c_str(), &directory) == 0 && (directory.st_mode & S_ISVTX) != 0 &&
         geteuid() != 0 && geteuid() != existing.st_uid && geteuid() != directory.st_uid;
}

} // namespace

OutputFile::OutputFile(const std::string &path) : name_(printable(path)) {
  if (path == "-") {
    name_ = "standard output";
    fd_ = STDOUT_FILENO;
    return;
  }
  if (const auto number = descriptorOf(path)) {
    fd_ = fcntl(*number, F_DUPFD_CLOEXEC, 0); // the same open file, its offset included
    if (fd_ < 0) {
      fail();
    }
    return;
  }
  open(path);
}

void OutputFile::open(const std::string &path) {
  struct stat existing = {};
  if (stat(path.c_str(), &existing) == 0) {
    S_ISREG(existing.st_mode) ? replaceFile(path, existing) : openDevice(path);
    return;
  }
  if (errno != ENOENT && errno != ENOTDIR) {
    fail();
  }
  if (lstat(path.c_str(), &existing) == 0) {
    throw failure("cannot write {}: it is a symbolic link that leads nowhere", name_);
  }
  replacedPath_ = path;
  temporary_ = std::make_unique<TemporaryFile>(path, name_, 0666);
  fd_ = temporary_->fd();
}

void OutputFile::openDevice(const std::string &path) {
  fd_ = ::open(path.c_str(), O_WRONLY | O_CLOEXEC);
  if (fd_ < 0) {
    fail();
  }
}

// Whatever would keep the file from being replaced in the end is found now.
void OutputFile::replaceFile(const std::string &path, const struct stat &existing) {
  if (faccessat(AT_FDCWD, path.c_str(), W_OK, AT_EACCESS) != 0) {
    fail();
  }
  replacedPath_ = realPathOf(path);
  if (isOthersInStickyDirectory(replacedPath_, existing)) {
    throw failure("cannot write {}: it is another user's, in a directory with the sticky bit",
                  name_);
  }
  temporary_ = std::make_unique<TemporaryFile>(replacedPath_, name_, 0600);
  fd_ = temporary_->fd();
  copyAttributes(replacedPath_, existing, fd_);
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
    } else if (errno == EPIPE) {
      endBySignal(SIGPIPE);
    } else if (errno != EINTR) {
      fail();
    }
  }
}

void OutputFile::put(std::string_view bytes) {
  kept_ += bytes;
  if (kept_.size() >= mostKept) {
    flush();
  }
}

void OutputFile::flush() {
  write(kept_);
  kept_.clear();
}

// Closing a second descriptor makes a file system report lost bytes, and standard output stays.
void OutputFile::commit(bool sync) {
  requireMemory(); // what ICU made without it must not take a file's place
  flush();
  if (temporary_) {
    temporary_->publish(sync);
    return;
  }
  const bool unsynced = sync && fsync(fd_) != 0 && errno != EINVAL && errno != EROFS;
  const int second = unsynced ? -1 : fcntl(fd_, F_DUPFD_CLOEXEC, 0);
  if (unsynced || (second >= 0 && close(second) != 0)) {
    fail();
  }
}

} // namespace nls2::tool
