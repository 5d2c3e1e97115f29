// Where a command writes: standard output, a file that appears when it is complete, or a device.
#pragma once

#include "io/input_file.h"

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

  // Whether the bytes go to the file at once, and not with commit().
  bool isDirect() const { return target_.empty(); }
  // Whether both replace, or write to, the same file.
  bool isSame(const OutputFile &other) const;
  bool isSame(const struct stat &other) const;
  // For one that is direct: what is read would grow without end. Throws Error.
  void requireOther(const InputFile &input) const;
  const std::string &name() const { return name_; } // for messages

private:
  OutputFile() = default;
  void makeFile(const std::string &path);
  void replaceFile(const std::string &path);
  void openTemporary(mode_t mode);
  void takeFreeName(const std::function<int(const char *)> &make);
  void giveUpName();
  void publish(bool sync);
  [[noreturn]] void fail() const;

  std::string name_;
  std::string target_;    // the file that commit() makes or replaces; empty for others
  std::string temporary_; // the name until then, while there is one
  std::string kept_;
  struct stat file_ = {}; // that was there before; none where the file is new
  int fd_ = -1;
};

// Writes all of the text to standard output at once, and returns exitDone. Throws Error.
int print(std::string_view text);

} // namespace nls2::tool
