// Where a command writes: standard output, a file that appears when it is complete, or a device.
#pragma once

#include "io/temporary_file.h"

#include <memory>
#include <string>
#include <string_view>

namespace nls2::tool {

class OutputFile {
public:
  // "-" is standard output. Throws Error.
  explicit OutputFile(const std::string &path);
  ~OutputFile();
  OutputFile(const OutputFile &) = delete;
  OutputFile &operator=(const OutputFile &) = delete;

  void write(std::string_view bytes); // throws Error
  // Without it a file that has been written disappears and the one before it stays. Throws Error.
  void commit();

  // The open file that the bytes go to at once; -1 for a file that is not seen before commit().
  int directFd() const { return temporary_ ? -1 : fd_; }

private:
  void replaceFile(const std::string &path);
  [[noreturn]] void fail() const;

  std::string name_;
  std::unique_ptr<TemporaryFile> temporary_;
  int fd_ = -1;
};

} // namespace nls2::tool
