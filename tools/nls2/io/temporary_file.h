// A file that has no name, or a temporary one, until it is complete.
#pragma once

#include <string>
#include <sys/types.h>

namespace nls2::tool {

// Lies in the directory of the path that it is going to have. Destroyed before publish(), it is
// gone; a signal that ends the process takes it along.
class TemporaryFile {
public:
  // `name` is what messages call the target. Throws Error.
  TemporaryFile(std::string target, std::string name, mode_t mode);
  ~TemporaryFile();
  TemporaryFile(const TemporaryFile &) = delete;
  TemporaryFile &operator=(const TemporaryFile &) = delete;

  int fd() const { return fd_; }
  // Closes it and gives it the name, in place of the file that has it now; `sync` also waits for
  // the disk. Throws Error.
  void publish(bool sync);

private:
  friend void removeTemporaryFiles();

  void openNamed(mode_t mode);
  void giveTemporaryName();
  void enlist();
  void leaveList();
  [[noreturn]] void fail() const;

  const std::string target_;
  const std::string shownName_;
  std::string name_;                        // the temporary name, while there is one
  const char *volatile toRemove_ = nullptr; // the same, for a signal handler
  TemporaryFile *volatile next_ = nullptr;  // in the list of those that have a name
  int fd_ = -1;
};

// Ends the process as this signal does when nobody handles it; temporary files are removed.
[[noreturn]] void endBySignal(int signal);

} // namespace nls2::tool
