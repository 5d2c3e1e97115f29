// Where a command writes: standard output, a file that appears when it is complete, or a device.
#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <sys/stat.h>

namespace nls2::tool {

class OutputFile {
public:
  // "-" is standard output. A path that leads to an open descriptor, such as /dev/stdout or
  // /dev/fd/3, is written to; a file is replaced by commit(). Throws Error.
  explicit OutputFile(const std::string &path);
  ~OutputFile();
  OutputFile(const OutputFile &) = delete;
  OutputFile &operator=(const OutputFile &) = delete;

  // Writes at once. A reader that has gone away ends the process, as SIGPIPE does. Throws Error.
  void write(std::string_view bytes);
  // Keeps small pieces of text until there are many; what is kept when it is destroyed is lost.
  void put(std::string_view bytes);
  void flush();
  // Without it a file that has been written disappears and the one before it stays. `sync` also
  // waits for the disk. Throws Error.
  void commit(bool sync = false);

  // The open file that the bytes go to at once; -1 for a file that is not seen before commit().
  int directFd() const { return target_.empty() ? fd_ : -1; }
  const std::string &name() const { return name_; } // for messages

private:
  OutputFile() = default;
  void makeFile(const std::string &path);
  void replaceFile(const std::string &path, const struct stat &existing);
  void openTemporary(mode_t mode);
  void takeFreeName(const std::function<int(const char *)> &make);
  void giveUpName();
  void publish(bool sync);
  [[noreturn]] void fail() const;

  std::string name_;
  std::string target_;    // the file that commit() makes or replaces; empty for others
  std::string temporary_; // the name until then, while there is one
  std::string kept_;
  int fd_ = -1;
};

// Writes all of the text to standard output at once. Throws Error.
void print(std::string_view text);

} // namespace nls2::tool
