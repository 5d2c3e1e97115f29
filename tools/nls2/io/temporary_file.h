// A file that has no name, or a temporary one, until it is complete.
#pragma once

#include <string>

namespace nls2::tool {

// Lies in the directory of the path that it is going to have. Destroyed before publish(), it is
// gone; a signal that ends the process takes it along.
class TemporaryFile {
public:
  // Throws Error.
  explicit TemporaryFile(std::string target);
  ~TemporaryFile();
  TemporaryFile(const TemporaryFile &) = delete;
  TemporaryFile &operator=(const TemporaryFile &) = delete;

  int fd() const { return fd_; }
  // Gives it the name, in place of the file that has it now. Throws Error.
  void publish();

private:
  void openNamed();
  void giveTemporaryName();

  const std::string target_;
  std::string name_; // the temporary name, while there is one
  int fd_ = -1;
};

} // namespace nls2::tool
