// Runs the built nls2 as a user does.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace tools {

// A directory of its own, removed with all that is in it.
class TempDir {
public:
  TempDir();
  ~TempDir();
  TempDir(const TempDir &) = delete;
  TempDir &operator=(const TempDir &) = delete;

  std::string path(const std::string &name) const { return path_ + "/" + name; }
  std::vector<std::string> names() const; // sorted

private:
  std::string path_;
};

void writeFile(const std::string &path, std::string_view bytes);
std::string readFile(const std::string &path);

// "--from 37 --strip" as arguments.
std::vector<std::string> words(const std::string &line);

struct Result {
  int exitCode = -1; // the negative signal number where a signal ended it
  std::string out;
  std::string err;
};

// Standard input is `input`, standard output a file that is read back. Runs in `directory`.
Result runTool(const std::vector<std::string> &arguments, std::string_view input = "",
               const std::string &directory = ".");
Result runTool(const std::string &line, std::string_view input = "",
               const std::string &directory = ".");

// The same for a line of sh, whose nls2 is the built one and whose $FAULTS is faults.c.
Result runShell(const std::string &line, std::string_view input, const std::string &directory);

} // namespace tools
