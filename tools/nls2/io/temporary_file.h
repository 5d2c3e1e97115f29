// A file that has no name, or a temporary one, until it is complete.
#pragma once

#include <string>
#include <sys/stat.h>

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
  // Gives it owner, mode, access list and extended attributes of the target, as far as that is
  // allowed. It is never open to more users than the target. Throws Error.
  void copyAttributes(const struct stat &target);
  // Closes it and gives it the name, in place of the file that has it now; `sync` also waits for
  // the disk. Throws Error.
  void publish(bool sync);

private:
  template <typename Make>
  void takeFreeName(Make make);
  void giveUpName();
  [[noreturn]] void fail() const;

  const std::string target_;
  const std::string shownName_;
  std::string name_; // the temporary name, while there is one
  int fd_ = -1;
};

// Ends the process as this signal does when nobody handles it; temporary files are removed. Safe in
// a signal handler.
[[noreturn]] void endBySignal(int signal);

} // namespace nls2::tool
