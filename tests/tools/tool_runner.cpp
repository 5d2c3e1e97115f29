// Runs the built nls2 as a user does.

#include "tool_runner.h"

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <spawn.h>
#include <sstream>
#include <stdexcept>
#include <sys/wait.h>
#include <unistd.h>

namespace tools {

namespace {

// Standard input is a pipe where `input` is a descriptor of one, else a file.
pid_t spawn(const std::vector<std::string> &command, int inputPipe, const std::string &input,
            const std::string &output, const std::string &error, const std::string &directory) {
  std::vector<char *> argv;
  for (const std::string &argument : command) {
    argv.push_back(const_cast<char *>(argument.c_str()));
  }
  argv.push_back(nullptr);
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  if (inputPipe >= 0) {
    posix_spawn_file_actions_adddup2(&actions, inputPipe, 0);
  } else {
    posix_spawn_file_actions_addopen(&actions, 0, input.c_str(), O_RDONLY, 0);
  }
  posix_spawn_file_actions_addopen(&actions, 1, output.c_str(), O_WRONLY | O_CREAT, 0666);
  posix_spawn_file_actions_addopen(&actions, 2, error.c_str(), O_WRONLY | O_CREAT, 0666);
  posix_spawn_file_actions_addchdir_np(&actions, directory.c_str());
  pid_t pid = -1;
  const int failed = posix_spawn(&pid, argv[0], &actions, nullptr, argv.data(), environ);
  posix_spawn_file_actions_destroy(&actions);
  if (failed != 0) {
    throw std::runtime_error("cannot start " + command[0]);
  }
  return pid;
}

std::vector<std::string> toolCommand(const std::vector<std::string> &arguments) {
  std::vector<std::string> command{NLS2_TOOL};
  command.insert(command.end(), arguments.begin(), arguments.end());
  return command;
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
  const int code =
      exitCodeOf(spawn(command, -1, dir.path("in"), dir.path("out"), dir.path("err"), directory));
  return {code, readFile(dir.path("out")), readFile(dir.path("err"))};
}

Result runTool(const std::vector<std::string> &arguments, std::string_view input,
               const std::string &directory) {
  return runCommand(toolCommand(arguments), input, directory);
}

Result runShell(const std::string &line, std::string_view input, const std::string &directory) {
  const std::string path = "PATH=" + std::filesystem::path(NLS2_TOOL).parent_path().string();
  return runCommand({"/bin/sh", "-c", path + ":$PATH; " + line}, input, directory);
}

Result runTool(const std::string &line, std::string_view input, const std::string &directory) {
  return runTool(words(line), input, directory);
}

RunningTool::RunningTool(const std::vector<std::string> &arguments, const std::string &outputPath,
                         const std::string &errorPath) {
  std::signal(SIGPIPE, SIG_IGN);
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) {
    throw std::runtime_error("cannot make a pipe");
  }
  pid_ = spawn(toolCommand(arguments), ends[0], "", outputPath, errorPath, ".");
  close(ends[0]);
  input_ = ends[1];
}

RunningTool::~RunningTool() {
  if (pid_ > 0) {
    kill(pid_, SIGKILL);
    wait();
  }
}

bool RunningTool::feed(std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t written = write(input_, bytes.data(), bytes.size());
    if (written < 0) {
      return false;
    }
    bytes.remove_prefix(static_cast<std::size_t>(written));
  }
  return true;
}

int RunningTool::wait() {
  close(input_);
  const int code = exitCodeOf(pid_);
  pid_ = -1;
  return code;
}

} // namespace tools
