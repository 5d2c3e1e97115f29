// Where a command writes: standard output, a file that appears when it is complete, or a device.

#include "io/output_file.h"

#include "options.h"

#include <cerrno>
#include <csignal>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <poll.h>
#include <unistd.h>

namespace nls2::tool {

namespace {

namespace fs = std::filesystem;

constexpr std::size_t mostKept = std::size_t{64} * 1024;

// The number in /proc/self/fd/NUMBER, to which /dev/stdout, /dev/fd/NUMBER and links of users lead.
// What lies behind that number is not looked at.
std::optional<int> descriptorOf(fs::path path) {
  const std::string ours = fmt::format("/proc/{}/", getpid());
  std::error_code error;
  for (int links = 0; links < 40 && !error; ++links) {
    const fs::path directory = path.has_parent_path() ? path.parent_path() : ".";
    const std::string real = fs::canonical(directory, error);
    if (real.starts_with(ours) && real.ends_with("/fd")) {
      return decimalNumber<int>(path.filename().native());
    }
    path = directory / fs::read_symlink(path, error);
  }
  return {};
}

// In a directory such as /tmp only the owner of a file, or of the directory, may replace it.
bool isOthersInStickyDirectory(const std::string &path, const struct stat &existing) {
  struct stat directory = {};
  return stat(fs::path(path).parent_path().c_str(), &directory) == 0 &&
         (directory.st_mode & S_ISVTX) != 0 && geteuid() != 0 && geteuid() != existing.st_uid &&
         geteuid() != directory.st_uid;
}

} // namespace

OutputFile::OutputFile(const std::string &path)
    : name_(path == "-" ? "standard output" : printable(path)) {
  struct stat existing = {};
  if (path == "-") {
    fd_ = STDOUT_FILENO;
  } else if (const auto number = descriptorOf(path)) {
    fd_ = fcntl(*number, F_DUPFD_CLOEXEC, 0); // the same open file, its offset included
  } else if (stat(path.c_str(), &existing) != 0) {
    makeFile(path);
  } else if (S_ISREG(existing.st_mode)) {
    replaceFile(path, existing);
  } else {
    fd_ = open(path.c_str(), O_WRONLY | O_CLOEXEC);
  }
  if (fd_ < 0) {
    fail();
  }
}

void OutputFile::makeFile(const std::string &path) {
  struct stat link = {};
  if (errno != ENOENT && errno != ENOTDIR) {
    fail();
  }
  if (lstat(path.c_str(), &link) == 0) {
    throw failure("cannot write {}: it is a symbolic link that leads nowhere", name_);
  }
  replacedPath_ = path;
  temporary_ = std::make_unique<TemporaryFile>(path, name_, 0666);
  fd_ = temporary_->fd();
}

// Whatever would keep the file from being replaced in the end is found now. A symbolic link stays
// one when its file is replaced.
void OutputFile::replaceFile(const std::string &path, const struct stat &existing) {
  std::error_code error;
  replacedPath_ = fs::canonical(path, error);
  if (error || faccessat(AT_FDCWD, path.c_str(), W_OK, AT_EACCESS) != 0) {
    fail();
  }
  if (isOthersInStickyDirectory(replacedPath_, existing)) {
    throw failure("cannot write {}: it is another user's, in a directory with the sticky bit",
                  name_);
  }
  temporary_ = std::make_unique<TemporaryFile>(replacedPath_, name_, 0600);
  fd_ = temporary_->fd();
  temporary_->copyAttributes(existing);
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

void print(std::string_view text) {
  requireMemory();
  OutputFile out("-");
  out.write(text);
  out.commit();
}

} // namespace nls2::tool
