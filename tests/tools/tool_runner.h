// Runs the built nls2 as a user does.
#pragma once

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <sys/wait.h>
#include <vector>

namespace tools {

namespace fs = std::filesystem;

// A directory of its own, removed with all that is in it.
class TempDir {
public:
  TempDir() : path_(fs::temp_directory_path() / "nls2-test-XXXXXX") {
    if (mkdtemp(path_.data()) == nullptr) {
      throw std::runtime_error("cannot make a directory");
    }
  }
  ~TempDir() { fs::remove_all(path_); }
  TempDir(const TempDir &) = delete;
  TempDir &operator=(const TempDir &) = delete;

  std::string path(const std::string &name) const { return path_ + "/" + name; }

private:
  std::string path_;
};

inline void writeFile(const std::string &path, std::string_view bytes) {
  std::ofstream(path, std::ios::binary) << bytes;
}

inline std::string readFile(const std::string &path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

inline std::vector<std::string> linesOf(const std::string &text) {
  std::vector<std::string> lines;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) {
    lines.push_back(line);
  }
  return lines;
}

struct Result {
  int exitCode;
  std::string out;
  std::string err;
};

// Runs a script of sh, whose nls2 is the built one. $FAULTS, loaded before nls2, makes calls fail.
inline Result run(const std::string &script, std::string_view input = "",
                  const std::string &directory = ".") {
  static const std::string folder = fs::path(NLS2_TOOL).parent_path();
  const TempDir streams;
  writeFile(streams.path("in"), input);
  writeFile(streams.path("script"), "PATH=" + folder + ":$PATH FAULTS=" TOOL_FAULTS "\n" + script);
  const std::string shell = "s=" + streams.path("") + "; cd " + directory + " && exec sh ";
  const int status = std::system((shell + "$s/script <$s/in >$s/out 2>$s/err").c_str());
  return {WEXITSTATUS(status), readFile(streams.path("out")), readFile(streams.path("err"))};
}

} // namespace tools
