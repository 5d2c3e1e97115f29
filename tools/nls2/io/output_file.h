// Writes to standard output, to a file that appears only when complete, or to a device.
#pragma once

#include "io/input_file.h"

#include <functional>
#include <string>
#include <string_view>
#include <sys/stat.h>

namespace nls2::tool {

class OutputFile {
public:
  // "-" is standard output. A path that names an open descriptor, such as /dev/stdout or /dev/fd/3,
  // is written directly; publish() replaces a file. Throws Error.
  explicit OutputFile(const std::string &path);
  ~OutputFile();
  OutputFile(const OutputFile &) = delete;
  OutputFile &operator=(const OutputFile &) = delete;

  // Writes immediately. If the reader has gone away, ends the process as SIGPIPE does. Throws
  // Error.
  void write(std::string_view bytes);
  // Buffers small pieces. The destructor does not write what is still buffered.
  void put(std::string_view bytes);
  void flush();
  // Writes everything and closes the file; `sync` also waits for the disk. Throws Error.
  void finish(bool sync = false);
  // Then gives the file its name. Without it the new file is discarded and the old one stays.
  // Throws Error.
  void publish(bool sync = false);
  void commit() {
    finish();
    publish();
  }

  // Whether bytes are written to the file directly, not by publish().
  bool isDirect() const { return target_.empty(); }
  // Whether both write or replace the same file.
  bool isSame(const OutputFile &other) const;
  bool isSame(const struct stat &other) const;
  // Throws Error if a direct output is also this input, which would then grow without end.
  void requireOther(const InputFile &input) const;
  const std::string &name() const { return name_; } // for messages

private:
  OutputFile() = default;
  void makeFile(const std::string &path);
  void replaceFile(const std::string &path);
  void openTemporary(mode_t mode);
  void takeFreeName(const std::function<int(const char *)> &make);
  void giveUpName();
  [[noreturn]] void fail() const;

  std::string name_;
  std::string target_;    // the file that publish() makes or replaces; empty for others
  std::string temporary_; // its name until then, if it has one
  std::string kept_;
  struct stat file_ = {}; // of the old file; all zero if there is none
  int fd_ = -1;
};

// Writes all of the text to standard output at once, and returns exitDone. Throws Error.
int print(std::string_view text);

} // namespace nls2::tool
