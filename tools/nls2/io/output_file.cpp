// Writes to standard output, to a file that appears only when complete, or to a device.

#include "io/output_file.h"

#include "base/errors.h"
#include "base/icu_memory.h"
#include "base/options.h"
#include "io/signals.h"

#include <acl/libacl.h>
#include <algorithm>
#include <attr/libattr.h>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>

namespace nls2::tool {

namespace {

namespace fs = std::filesystem;

constexpr std::size_t mostKept = std::size_t{64} * 1024;

std::string directoryOf(const std::string &path) {
  const auto parent = fs::path(path).parent_path();
  return parent.empty() ? "." : parent.string();
}

// The descriptor that /dev/stdout, /dev/fd/N and the like name.
std::optional<int> descriptorOf(std::string_view path) {
  if (path == "/dev/stdout" || path == "/dev/stderr") {
    return path == "/dev/stdout" ? STDOUT_FILENO : STDERR_FILENO;
  }
  for (const std::string_view directory : {"/dev/fd/", "/proc/self/fd/"}) {
    if (path.starts_with(directory)) {
      return wholeNumber<int>(path.substr(directory.size()));
    }
  }
  return {};
}

std::string ownPath(int fd) { return fmt::format("/proc/self/fd/{}", fd); }

// In a directory such as /tmp, only the owner of the file or of the directory may replace a file.
bool isOthersInStickyDirectory(const std::string &path, const struct stat &existing) {
  struct stat directory = {};
  return stat(directoryOf(path).c_str(), &directory) == 0 && (directory.st_mode & S_ISVTX) != 0 &&
         geteuid() != 0 && geteuid() != existing.st_uid && geteuid() != directory.st_uid;
}

// The owner first, because a change of owner clears mode bits. Only the superuser may give a file
// away, but its group may still be one of the caller's. Capabilities are not copied, since the
// contents change. Attributes that cannot be read or set are skipped.
void copyAttributes(int fd, const std::string &path, const std::string &target,
                    const struct stat &existing) {
  if (fchown(fd, existing.st_uid, existing.st_gid) != 0 &&
      fchown(fd, static_cast<uid_t>(-1), existing.st_gid) != 0 && errno != EPERM) {
    throw failure("cannot keep the file's owner: {}", std::strerror(errno));
  }
  if (perm_copy_file(target.c_str(), path.c_str(), nullptr) != 0) {
    throw failure("cannot keep the file's permissions: {}", std::strerror(errno));
  }
  const int old = open(target.c_str(), O_RDONLY | O_CLOEXEC);
  if (old >= 0) {
    const auto isWanted = [](const char *name, error_context *context) {
      return static_cast<int>(attr_copy_check_permissions(name, context) != 0 &&
                              std::strcmp(name, "security.capability") != 0);
    };
    attr_copy_fd(target.c_str(), old, path.c_str(), fd, isWanted, nullptr);
    close(old);
  }
}

} // namespace

// Delegates to the default constructor, so that the destructor removes the temporary file if this
// throws.
OutputFile::OutputFile(const std::string &path) : OutputFile() {
  name_ = shownName(path, "standard output");
  if (path == "-") {
    fd_ = STDOUT_FILENO;
  } else if (const auto number = descriptorOf(path)) {
    fd_ = fcntl(*number, F_DUPFD_CLOEXEC, 0); // the same open file, with its offset
  } else if (stat(path.c_str(), &file_) != 0) {
    makeFile(path);
  } else if (S_ISREG(file_.st_mode)) {
    replaceFile(path);
  } else {
    fd_ = open(path.c_str(), O_WRONLY | O_CLOEXEC);
  }
  if (fd_ < 0 || (target_.empty() && fstat(fd_, &file_) != 0)) {
    fail();
  }
}

// Terminals and the null device may serve several purposes at once.
bool OutputFile::isSame(const struct stat &other) const {
  return file_.st_ino == other.st_ino && file_.st_dev == other.st_dev &&
         (S_ISREG(file_.st_mode) || S_ISFIFO(file_.st_mode));
}

bool OutputFile::isSame(const OutputFile &other) const {
  return isSame(other.file_) || (!target_.empty() && target_ == other.target_);
}

void OutputFile::requireOther(const InputFile &input) const {
  if (isSame(input.facts())) {
    throw failure("cannot read {}: it is also {}", input.name(), name_);
  }
}

void OutputFile::makeFile(const std::string &path) {
  struct stat link = {};
  if (path.empty() || (errno != ENOENT && errno != ENOTDIR)) {
    fail();
  }
  if (lstat(path.c_str(), &link) == 0) {
    throw failure("cannot write {}: it is a symbolic link to a missing file", name_);
  }
  std::error_code error;
  target_ = fs::weakly_canonical(fs::absolute(path), error);
  if (error) {
    fail();
  }
  openTemporary(0666);
}

// Finds out now whether the file can be replaced at the end. A symbolic link stays a link to the
// new file.
void OutputFile::replaceFile(const std::string &path) {
  std::error_code error;
  target_ = fs::canonical(path, error);
  if (error || faccessat(AT_FDCWD, path.c_str(), W_OK, AT_EACCESS) != 0) {
    fail();
  }
  if (isOthersInStickyDirectory(target_, file_)) {
    throw failure("cannot write {}: it belongs to another user, in a directory with the sticky bit",
                  name_);
  }
  openTemporary(0600);
  copyAttributes(fd_, temporary_.empty() ? ownPath(fd_) : temporary_, target_, file_);
}

// File systems without unnamed files, and systems without /proc, need a name from the start.
void OutputFile::openTemporary(mode_t mode) {
  catchEndingSignals();
  fd_ = open(directoryOf(target_).c_str(), O_TMPFILE | O_RDWR | O_CLOEXEC, mode);
  if (fd_ >= 0 && access(ownPath(fd_).c_str(), F_OK) == 0) {
    return;
  }
  if (fd_ >= 0) {
    close(std::exchange(fd_, -1));
  }
  takeFreeName([&](const char *free) {
    return fd_ = open(free, O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, mode);
  });
}

// Calls `make` with names in the target's directory until one is free.
void OutputFile::takeFreeName(const std::function<int(const char *)> &make) {
  const SignalsHeldBack held;
  int made = -1;
  for (int attempt = 0; made < 0 && attempt < 1000; ++attempt) {
    temporary_ = fmt::format("{}/.nls2-{}-{}.tmp", directoryOf(target_), getpid(), attempt);
    made = make(temporary_.c_str());
    if (made < 0 && errno != EEXIST) {
      break;
    }
  }
  if (made < 0) {
    temporary_.clear();
    throw failure("cannot write {}: cannot create a file in its directory: {}", name_,
                  std::strerror(errno));
  }
  *std::find(namesToRemove.begin(), namesToRemove.end(), nullptr) = temporary_.c_str();
}

void OutputFile::giveUpName() {
  for (const char *volatile &name : namesToRemove) {
    name = name == temporary_.c_str() ? nullptr : name;
  }
  temporary_.clear();
}

OutputFile::~OutputFile() {
  const SignalsHeldBack held;
  if (!temporary_.empty()) {
    unlink(temporary_.c_str());
    giveUpName();
  }
  if (fd_ >= 0 && fd_ != STDOUT_FILENO) {
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

// linkat() cannot replace a file, so an unnamed file first gets a free name, which publish() changes.
// A file system may report lost bytes only in close(). Closing a duplicate descriptor makes it do
// so and leaves standard output open.
void OutputFile::finish(bool sync) {
  requireMemory(); // without memory the output may be wrong
  flush();
  if (target_.empty()) {
    const bool unsynced = sync && fsync(fd_) != 0 && errno != EINVAL && errno != EROFS;
    const int second = unsynced ? -1 : fcntl(fd_, F_DUPFD_CLOEXEC, 0);
    if (unsynced || (second >= 0 && close(second) != 0)) {
      fail();
    }
    return;
  }
  const SignalsHeldBack held;
  if (temporary_.empty()) {
    takeFreeName([&](const char *free) {
      return linkat(AT_FDCWD, ownPath(fd_).c_str(), AT_FDCWD, free, AT_SYMLINK_FOLLOW);
    });
  }
  if ((sync && fsync(fd_) != 0) || close(std::exchange(fd_, -1)) != 0) {
    fail();
  }
}

void OutputFile::publish(bool sync) {
  if (target_.empty()) {
    return;
  }
  const SignalsHeldBack held;
  if (std::rename(temporary_.c_str(), target_.c_str()) != 0) {
    fail();
  }
  giveUpName();
  if (sync) {
    fd_ = open(directoryOf(target_).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (fd_ < 0 || (fsync(fd_) != 0 && errno != EINVAL)) {
      fail();
    }
  }
}

int print(std::string_view text) {
  requireMemory();
  OutputFile out("-");
  out.write(text);
  out.commit();
  return exitDone;
}

} // namespace nls2::tool
