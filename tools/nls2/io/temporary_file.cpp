// A file that has no name, or a temporary one, until it is complete.

#include "io/temporary_file.h"

#include "errors.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <unistd.h>
#include <utility>

namespace nls2::tool {

namespace {

// Those that end a process unless it handles them, and that others send or a clock does.
constexpr std::array endingSignals{SIGHUP,    SIGINT,  SIGQUIT, SIGTERM,  SIGALRM,
                                   SIGUSR1,   SIGUSR2, SIGXCPU, SIGPIPE,  SIGPOLL,
                                   SIGVTALRM, SIGPROF, SIGPWR,  SIGSTKFLT};

// The files that a signal handler has to remove. The list changes only while the signals are held
// back, and while no other thread of the process could get them in this one's place.
TemporaryFile *volatile firstNamed = nullptr;

} // namespace

void removeTemporaryFiles() {
  for (TemporaryFile *file = firstNamed; file != nullptr; file = file->next_) {
    if (file->toRemove_ != nullptr) {
      unlink(file->toRemove_);
    }
  }
}

namespace {

extern "C" void removeAndDie(int signal) {
  removeTemporaryFiles();
  std::signal(signal, SIG_DFL);
  raise(signal); // delivered on return from the handler
}

// Signals that the caller had ignored, as nohup does, stay ignored.
void catchEndingSignals() {
  for (const int signal : endingSignals) {
    struct sigaction action = {};
    sigaction(signal, nullptr, &action);
    if (action.sa_handler == SIG_DFL) {
      action.sa_handler = removeAndDie;
      sigaction(signal, &action, nullptr);
    }
  }
}

class SignalsHeldBack {
public:
  SignalsHeldBack() {
    sigset_t set;
    sigemptyset(&set);
    for (const int signal : endingSignals) {
      sigaddset(&set, signal);
    }
    pthread_sigmask(SIG_BLOCK, &set, &before_);
  }
  ~SignalsHeldBack() { pthread_sigmask(SIG_SETMASK, &before_, nullptr); }
  SignalsHeldBack(const SignalsHeldBack &) = delete;
  SignalsHeldBack &operator=(const SignalsHeldBack &) = delete;

private:
  sigset_t before_;
};

std::string directoryOf(const std::string &path) {
  const std::size_t slash = path.rfind('/');
  return slash == std::string::npos ? "." : path.substr(0, slash + 1);
}

std::string ownPath(int fd) { return fmt::format("/proc/self/fd/{}", fd); }

// Calls `make` with names beside the target until one is free.
template <typename Make>
std::string takeFreeName(const std::string &target, const std::string &shownName, Make make) {
  for (int attempt = 0; attempt < 1000; ++attempt) {
    std::string name = fmt::format("{}/.nls2-{}-{}.tmp", directoryOf(target), getpid(), attempt);
    if (make(name.c_str()) >= 0) {
      return name;
    }
    if (errno != EEXIST) {
      break;
    }
  }
  throw failure("cannot write {}: no new file in its directory: {}", shownName,
                std::strerror(errno));
}

} // namespace

void endBySignal(int signal) {
  removeTemporaryFiles();
  std::signal(signal, SIG_DFL);
  sigset_t set;
  sigemptyset(&set);
  sigaddset(&set, signal);
  pthread_sigmask(SIG_UNBLOCK, &set, nullptr);
  raise(signal);
  _exit(128 + signal);
}

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
  openNamed(mode); // file systems without unnamed files, and systems without /proc
}

TemporaryFile::~TemporaryFile() {
  const SignalsHeldBack held;
  if (!name_.empty()) {
    leaveList();
    unlink(name_.c_str());
  }
  if (fd_ >= 0) {
    close(fd_);
  }
}

void TemporaryFile::fail() const {
  throw failure("cannot write {}: {}", shownName_, std::strerror(errno));
}

void TemporaryFile::enlist() {
  toRemove_ = name_.c_str();
  next_ = firstNamed;
  firstNamed = this;
}

void TemporaryFile::leaveList() {
  toRemove_ = nullptr;
  TemporaryFile *volatile *place = &firstNamed;
  while (*place != this) {
    place = &(*place)->next_;
  }
  *place = next_;
}

void TemporaryFile::openNamed(mode_t mode) {
  const SignalsHeldBack held;
  name_ = takeFreeName(target_, shownName_, [&](const char *name) {
    return fd_ = open(name, O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, mode);
  });
  enlist();
}

// An unnamed file can take a free name only; the step from there to the target is a rename.
void TemporaryFile::giveTemporaryName() {
  name_ = takeFreeName(target_, shownName_, [&](const char *name) {
    return linkat(AT_FDCWD, ownPath(fd_).c_str(), AT_FDCWD, name, AT_SYMLINK_FOLLOW);
  });
  enlist();
}

// A file system may report only at close() that bytes were lost: before the name is taken.
void TemporaryFile::publish(bool sync) {
  const SignalsHeldBack held;
  if (name_.empty()) {
    giveTemporaryName();
  }
  if ((sync && fsync(fd_) != 0) || close(std::exchange(fd_, -1)) != 0 ||
      std::rename(name_.c_str(), target_.c_str()) != 0) {
    fail();
  }
  leaveList();
  name_.clear();
  if (sync) {
    const int directory = open(directoryOf(target_).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    const bool failed = directory < 0 || fsync(directory) != 0;
    const int cause = errno;
    if (directory >= 0) {
      close(directory);
    }
    if (failed) {
      errno = cause;
      fail();
    }
  }
}

} // namespace nls2::tool
