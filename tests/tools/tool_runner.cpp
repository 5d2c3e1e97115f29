// Runs the built nls2 as a user does.

#include "tool_runner.h"

#include <algorithm>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>
#include <sys/wait.h>
#include <unistd.h>

namespace tools {

namespace {

// Standard input is the file `in` of `streams`, and the others are `out` and `err` there.
pid_t spawn(const std::vector<std::string> &command, const TempDir &streams,
            const std::string &directory) {
  std::vector<char *> argv;
  for (const std::string &argument : command) {
    argv.push_back(const_cast<char *>(argument.c_str()));
  }
  argv.push_back(nullptr);
  const std::string paths[] = {streams.path("in"), streams.path("out"), streams.path("err")};
  const pid_t pid = fork();
  if (pid == 0) {
    for (int i = 0; i < 3; ++i) {
      dup2(open(paths[i].c_str(), (i == 0 ? O_RDONLY : O_WRONLY | O_CREAT) | O_CLOEXEC, 0666), i);
    }
    if (chdir(directory.c_str()) == 0) {
      execv(argv[0], argv.data());
    }
    _exit(127);
  }
  return pid;
}

int exitCodeOf(pid_t pid) {
  int status = 0;
  waitpid(pid, &status, 0);
  return WIFSIGNALED(status) ? -WTERMSIG(status) : WEXITSTATUS(status);
}

} // namespace

TempDir::TempDir() {
  std::string pattern = std::filesystem::temp_directory_path() / "nls2-test-XXXXXX";
  if (mkdtemp(pattern.data()) == nullptr) {
    throw std::runtime_error("cannot make a directory");
  }
  path_ = pattern;
}

TempDir::~TempDir() { std::filesystem::remove_all(path_); }

std::vector<std::string> TempDir::names() const {
  std::vector<std::string> found;
  for (const auto &entry : std::filesystem::directory_iterator(path_)) {
    found.push_back(entry.path().filename());
  }
  std::sort(found.begin(), found.end());
  return found;
}

void writeFile(const std::string &path, std::string_view bytes) {
  std::ofstream(path, std::ios::binary)
      .write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
}

std::string readFile(const std::string &path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

std::vector<std::string> words(const std::string &line) {
  std::istringstream stream(line);
  return {std::istream_iterator<std::string>(stream), {}};
}

static Result runCommand(const std::vector<std::string> &command, std::string_view input,
                         const std::string &directory) {
  const TempDir dir;
  writeFile(dir.path("in"), input);
  const int code = exitCodeOf(spawn(command, dir, directory));
  return {code, readFile(dir.path("out")), readFile(dir.path("err"))};
}

Result runTool(const std::vector<std::string> &arguments, std::string_view input,
               const std::string &directory) {
  std::vector<std::string> command{NLS2_TOOL};
  command.insert(command.end(), arguments.begin(), arguments.end());
  return runCommand(command, input, directory);
}

Result runShell(const std::string &line, std::string_view input, const std::string &directory) {
  const std::string path = "PATH=" + std::filesystem::path(NLS2_TOOL).parent_path().string();
  return runCommand({"/bin/sh", "-c", path + ":$PATH FAULTS=" TOOL_FAULTS "; " + line}, input,
                    directory);
}

Result runTool(const std::string &line, std::string_view input, const std::string &directory) {
  return runTool(words(line), input, directory);
}

} // namespace tools
