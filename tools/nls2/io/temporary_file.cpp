// A file that has no name, or a temporary one, until it is complete.

#include "io/temporary_file.h"

#include "errors.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <linux/limits.h>
#include <sys/xattr.h>
#include <unistd.h>
#include <utility>

namespace nls2::tool {

namespace {

// Those that end a process unless it handles them, and that others send or a clock does.
constexpr std::array endingSignals{SIGHUP,    SIGINT,  SIGQUIT, SIGTERM,  SIGALRM,
                                   SIGUSR1,   SIGUSR2, SIGXCPU, SIGPIPE,  SIGPOLL,
                                   SIGVTALRM, SIGPROF, SIGPWR,  SIGSTKFLT};

// The names that a signal handler has to remove, with room for more than a command ever has. They
// change only while the signals are held back, and while no other thread of the process could get
// them in this one's place.
std::array<const char *volatile, 8> namesToRemove{};

// Signals that the caller had ignored, as nohup does, stay ignored.
void catchEndingSignals() {
  for (const int signal : endingSignals) {
    struct sigaction action = {};
    sigaction(signal, nullptr, &action);
    if (action.sa_handler == SIG_DFL) {
      action.sa_handler = endBySignal;
      sigaction(signal, &action, nullptr);
    }
  }
}

class SignalsHeldBack {
public:
  SignalsHeldBack() {
    sigset_t set;
    sigfillset(&set);
    pthread_sigmask(SIG_BLOCK, &set, &before_);
  }
  ~SignalsHeldBack() { pthread_sigmask(SIG_SETMASK, &before_, nullptr); }
  SignalsHeldBack(const SignalsHeldBack &) = delete;
  SignalsHeldBack &operator=(const SignalsHeldBack &) = delete;

private:
  sigset_t before_;
};

std::string directoryOf(const std::string &path) {
  const auto parent = std::filesystem::path(path).parent_path();
  return parent.empty() ? "." : parent.string();
}

std::string ownPath(int fd) { return fmt::format("/proc/self/fd/{}", fd); }

// No attribute, and no list of their names, is longer; empty where it cannot be read.
template <typename Get>
std::string attributeBytes(Get get) {
  std::string bytes(XATTR_LIST_MAX, '\0');
  bytes.resize(static_cast<std::size_t>(std::max<ssize_t>(get(bytes.data(), bytes.size()), 0)));
  return bytes;
}

std::string valueOf(const std::string &path, const char *name) {
  return attributeBytes(
      [&](char *buffer, std::size_t size) { return getxattr(path.c_str(), name, buffer, size); });
}

} // namespace

void endBySignal(int signal) {
  for (const char *name : namesToRemove) {
    if (name != nullptr) {
      unlink(name);
    }
  }
  std::signal(signal, SIG_DFL);
  sigset_t set;
  sigemptyset(&set);
  sigaddset(&set, signal);
  pthread_sigmask(SIG_UNBLOCK, &set, nullptr);
  raise(signal);
  _exit(128 + signal);
}

// File systems without unnamed files, and systems without /proc, get a name at once.
TemporaryFile::TemporaryFile(std::string target, std::string name, mode_t mode)
    : target_(std::move(target)), shownName_(std::move(name)) {
  catchEndingSignals();
  fd_ = open(directoryOf(target_).c_str(), O_TMPFILE | O_RDWR | O_CLOEXEC, mode);
  if (fd_ >= 0 && access(ownPath(fd_).c_str(), F_OK) == 0) {
    return;
  }
  if (fd_ >= 0) {
    close(fd_);
  }
  takeFreeName([&](const char *free) {
    return fd_ = open(free, O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, mode);
  });
}

TemporaryFile::~TemporaryFile() {
  const SignalsHeldBack held;
  if (!name_.empty()) {
    unlink(name_.c_str());
    giveUpName();
  }
  if (fd_ >= 0) {
    close(fd_);
  }
}

void TemporaryFile::fail() const {
  throw failure("cannot write {}: {}", shownName_, std::strerror(errno));
}

// Calls `make` with names beside the target until one is free.
template <typename Make>
void TemporaryFile::takeFreeName(Make make) {
  const SignalsHeldBack held;
  int made = -1;
  for (int attempt = 0; made < 0 && attempt < 1000; ++attempt) {
    name_ = fmt::format("{}/.nls2-{}-{}.tmp", directoryOf(target_), getpid(), attempt);
    made = make(name_.c_str());
    if (made < 0 && errno != EEXIST) {
      break;
    }
  }
  if (made < 0) {
    name_.clear();
    throw failure("cannot write {}: no new file in its directory: {}", shownName_,
                  std::strerror(errno));
  }
  *std::find(namesToRemove.begin(), namesToRemove.end(), nullptr) = name_.c_str();
}

void TemporaryFile::giveUpName() {
  for (const char *volatile &name : namesToRemove) {
    name = name == name_.c_str() ? nullptr : name;
  }
  name_.clear();
}

// The owner first, since a change of owner takes mode bits away. Only the superuser may give a file
// away; its group may still be one of the caller's.
//
// Where an access list is, the mode's group bits are its mask, which may allow more than the list
// allows the group. A file that cannot have the list is therefore the owner's alone. A list that
// the directory gave to the new file goes where the old one had none.
//
// Capabilities are for the program that the old file was. Others that cannot be set are left out.
void TemporaryFile::copyAttributes(const struct stat &target) {
  constexpr std::string_view accessList = "system.posix_acl_access";
  if (fchown(fd_, target.st_uid, target.st_gid) != 0 &&
      fchown(fd_, static_cast<uid_t>(-1), target.st_gid) != 0 && errno != EPERM) {
    throw failure("cannot keep the file's owner: {}", std::strerror(errno));
  }
  fremovexattr(fd_, accessList.data());
  const bool hasList = !valueOf(target_, accessList.data()).empty();
  if (fchmod(fd_, target.st_mode & (hasList ? 0700 : 0777)) != 0) {
    throw failure("cannot keep the file's permissions: {}", std::strerror(errno));
  }
  const std::string names = attributeBytes(
      [&](char *buffer, std::size_t size) { return listxattr(target_.c_str(), buffer, size); });
  for (const char *name = names.c_str(); *name != '\0'; name += std::strlen(name) + 1) {
    if (std::string_view(name) != "security.capability") {
      const std::string value = valueOf(target_, name);
      static_cast<void>(fsetxattr(fd_, name, value.data(), value.size(), 0));
    }
  }
}

// An unnamed file can take a free name only; the step from there to the target is a rename. A file
// system may report only at close() that bytes were lost: before the name is taken.
void TemporaryFile::publish(bool sync) {
  const SignalsHeldBack held;
  if (name_.empty()) {
    takeFreeName([&](const char *free) {
      return linkat(AT_FDCWD, ownPath(fd_).c_str(), AT_FDCWD, free, AT_SYMLINK_FOLLOW);
    });
  }
  if ((sync && fsync(fd_) != 0) || close(std::exchange(fd_, -1)) != 0 ||
      std::rename(name_.c_str(), target_.c_str()) != 0) {
    fail();
  }
  giveUpName();
  if (sync) {
    fd_ = open(directoryOf(target_).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (fd_ < 0 || fsync(fd_) != 0) {
      fail();
    }
  }
}

} // namespace nls2::tool
