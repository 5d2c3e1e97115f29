// A file that has no name, or a temporary one, until it is complete.

#include "io/temporary_file.h"

#include "errors.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <fmt/core.h>
#include <unistd.h>

namespace nls2::tool {

namespace {

constexpr std::array endingSignals{SIGHUP, SIGINT, SIGQUIT, SIGTERM};

// The name that a signal handler has to remove. Changed only while the signals are held back.
const char *volatile nameToRemove = nullptr;

extern "C" void removeAndDie(int signal) {
  if (nameToRemove != nullptr) {
    unlink(nameToRemove);
  }
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
std::string takeFreeName(const std::string &target, Make make) {
  for (int attempt = 0; attempt < 1000; ++attempt) {
    std::string name = fmt::format("{}/.nls2-{}-{}.tmp", directoryOf(target), getpid(), attempt);
    if (make(name.c_str()) >= 0) {
      return name;
    }
    if (errno != EEXIST) {
      break;
    }
  }
  throw failure("cannot create a file beside {}: {}", target, std::strerror(errno));
}

} // namespace

TemporaryFile::TemporaryFile(std::string target) : target_(std::move(target)) {
  catchEndingSignals();
  fd_ = open(directoryOf(target_).c_str(), O_TMPFILE | O_RDWR | O_CLOEXEC, 0666);
  if (fd_ >= 0 && access(ownPath(fd_).c_str(), F_OK) == 0) {
    return;
  }
  if (fd_ >= 0) {
    close(fd_);
  }
  openNamed(); // file systems without unnamed files, and systems without /proc
}

TemporaryFile::~TemporaryFile() {
  const SignalsHeldBack held;
  nameToRemove = nullptr;
  if (!name_.empty()) {
    unlink(name_.c_str());
  }
  close(fd_);
}

void TemporaryFile::openNamed() {
  const SignalsHeldBack held;
  name_ = takeFreeName(target_, [&](const char *name) {
    return fd_ = open(name, O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
  });
  nameToRemove = name_.c_str();
}

// An unnamed file can take a free name only; the step from there to the target is a rename.
void TemporaryFile::giveTemporaryName() {
  name_ = takeFreeName(target_, [&](const char *name) {
    return linkat(AT_FDCWD, ownPath(fd_).c_str(), AT_FDCWD, name, AT_SYMLINK_FOLLOW);
  });
  nameToRemove = name_.c_str();
}

void TemporaryFile::publish() {
  const SignalsHeldBack held;
  if (name_.empty()) {
    giveTemporaryName();
  }
  if (std::rename(name_.c_str(), target_.c_str()) != 0) {
    throw failure("{}: {}", target_, std::strerror(errno));
  }
  nameToRemove = nullptr;
  name_.clear();
}

} // namespace nls2::tool
