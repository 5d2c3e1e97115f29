// Reads from a file or from standard input.
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

  // Up to `length` bytes, as soon as there are any; 0 at the end and after interrupt(). Throws
  // Error.
  std::size_t read(char *buffer, std::size_t length);
  void interrupt() const;
  // Skips the next bytes, by seeking if the file can; fewer if it ends first. Throws Error.
  void skip(uint64_t bytes);
  // The number of bytes to the end, if known.
  std::optional<uint64_t> bytesLeft() const;

  struct stat facts() const;                        // all zero if unavailable
  const std::string &name() const { return name_; } // for messages

private:
  [[noreturn]] void fail() const;

  std::string name_;
  const int fd_;
  const int wakeFd_; // interrupt() makes it readable
};

// The given paths, or standard input if there are none.
inline std::vector<std::string> inputsOf(const std::vector<std::string> &given) {
  return given.empty() ? std::vector<std::string>{"-"} : given;
}

} // namespace nls2::tool
