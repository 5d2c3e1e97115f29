// Where a command reads from: a file or standard input.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <sys/stat.h>
#include <vector>

namespace nls2::tool {

class InputFile {
public:
  // "-" is standard input. Throws Error.
  explicit InputFile(const std::string &path);
  ~InputFile();
  InputFile(const InputFile &) = delete;
  InputFile &operator=(const InputFile &) = delete;

  // Up to `length` bytes, as many as are there at once; 0 at the end, and after interrupt(). Throws
  // Error.
  std::size_t read(char *buffer, std::size_t length);
  void interrupt() const;
  // Leaves out the next bytes, by seeking where the file can; fewer where it ends before. Throws
  // Error.
  void skip(uint64_t bytes);
  // The bytes from here to the end, where that is known.
  std::optional<uint64_t> bytesLeft() const;

  struct stat facts() const;                        // all zero where they cannot be had
  const std::string &name() const { return name_; } // for messages

private:
  [[noreturn]] void fail() const;

  std::string name_;
  const int fd_;
  const int wakeFd_; // becomes readable for good
};

// The paths of a command that reads standard input where it is given none.
inline std::vector<std::string> inputsOf(const std::vector<std::string> &given) {
  return given.empty() ? std::vector<std::string>{"-"} : given;
}

} // namespace nls2::tool
