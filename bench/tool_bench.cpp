// nls2 translate beside dd and beside iconv, fold and sed: 80 MB of 80-byte EBCDIC records to lines
// of text without trailing blanks. Real time, and the peak memory of the process (of the largest
// one, for the pipe). The system counts in the memory of the process that starts another one, so no
// peak comes out below the few megabytes of this program.

#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <random>
#include <spawn.h>
#include <string>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

constexpr std::size_t recordCount = 1'000'000;
constexpr std::size_t recordLength = 80;

// The input and every output lie here while the program runs.
class WorkDir {
public:
  WorkDir() {
    std::string pattern = std::filesystem::temp_directory_path() / "nls2-bench-XXXXXX";
    if (mkdtemp(pattern.data()) == nullptr) {
      std::perror("nls2-bench");
      std::exit(1);
    }
    path_ = pattern;
  }
  ~WorkDir() { std::filesystem::remove_all(path_); }
  WorkDir(const WorkDir &) = delete;
  WorkDir &operator=(const WorkDir &) = delete;

  std::string path(const char *name) const { return path_ + "/" + name; }

private:
  std::string path_;
};

// Letters and digits of EBCDIC, 10 to 80 of them, and blanks.
void makeInput(const std::string &path) {
  const std::string letters = "\x81\x85\x89\x95\xA2\xA3\xC1\xD4\xE2\xF0\xF7\x40\x6B";
  std::mt19937 random(1);
  std::ofstream file(path, std::ios::binary);
  for (std::size_t i = 0; i < recordCount; ++i) {
    std::string record(recordLength, '\x40');
    const std::size_t text = 10 + random() % (recordLength - 9);
    for (std::size_t k = 0; k < text; ++k) {
      record[k] = letters[random() % letters.size()];
    }
    file << record;
  }
}

struct Command {
  const char *name;
  std::string line; // for the shell
};

struct Run {
  bool succeeded;
  long peakKilobytes;
};

// The shell replaces itself by a single command; of a pipe it waits for the last.
Run runShell(const std::string &line) {
  const char *argv[] = {"sh", "-c", line.c_str(), nullptr};
  pid_t pid = -1;
  if (posix_spawn(&pid, "/bin/sh", nullptr, nullptr, const_cast<char **>(argv), environ) != 0) {
    return {false, 0};
  }
  int status = 0;
  rusage usage = {};
  wait4(pid, &status, 0, &usage);
  return {status == 0, usage.ru_maxrss};
}

void time(benchmark::State &state, const Command &command) {
  long peak = 0;
  for (auto iteration : state) {
    const Run run = runShell(command.line);
    if (!run.succeeded) {
      state.SkipWithError("the command failed");
      break;
    }
    peak = std::max(peak, run.peakKilobytes);
  }
  state.counters["peakKB"] = static_cast<double>(peak);
  state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(recordCount * recordLength));
}

// Runs all commands once, which also warms the files, and compares what they wrote. fold leaves the
// last line without its end.
bool answersAgree(const WorkDir &dir, const Command (&commands)[3]) {
  for (const Command &command : commands) {
    if (!runShell(command.line).succeeded) {
      std::cerr << command.name << " failed: " << command.line << "\n";
      return false;
    }
  }
  const std::string compare = "cd '" + dir.path(".") +
                              "' && test -s nls2 && cmp nls2 dd && "
                              "{ cat iconv && echo; } | cmp nls2 -";
  return runShell(compare).succeeded;
}

int runAll(int argc, char **argv) {
  const WorkDir dir;
  makeInput(dir.path("in"));
  const std::string in = "'" + dir.path("in") + "'";
  const auto to = [&](const char *name) { return " '" + dir.path(name) + "'"; };
  const Command commands[] = {
      {"nls2", "exec " NLS2_TOOL " translate --from 37 --to 1208 --record-length 80 --strip "
               "--newline lf " +
                   in + to("nls2")},
      {"dd", "exec dd conv=ascii,unblock cbs=80 status=none if=" + in + " of=" + dir.path("dd")},
      {"iconv_fold_sed",
       "iconv -f IBM037 -t UTF-8 " + in + " | fold -w 80 | sed 's/ *$//' >" + to("iconv")},
  };
  benchmark::Initialize(&argc, argv);
  if (!answersAgree(dir, commands)) {
    return 1;
  }
  for (const Command &command : commands) {
    benchmark::RegisterBenchmark(command.name,
                                 [&](benchmark::State &state) { time(state, command); })
        ->Unit(benchmark::kMillisecond)
        ->UseRealTime()
        ->Iterations(3);
  }
  benchmark::RunSpecifiedBenchmarks();
  return 0;
}

} // namespace

int main(int argc, char **argv) { return runAll(argc, argv); }
