// nls2 detect: reports the Unicode signatures of files.

#include "base/json.h"
#include "base/options.h"
#include "io/input_file.h"
#include "io/output_file.h"
#include "nls2.h"

#include <algorithm>
#include <memory>

namespace nls2::tool {

namespace {

constexpr std::size_t longestSignature = 5;

constexpr const char *notes =
    R"(A file without a signature may still be Unicode. FF FE 00 00 is reported as UTF-32LE, even if it is a
UTF-16LE text that begins with a null.
Exit codes: 0 every file has a signature, 1 some file has none, 2 error.
)";

struct Arguments {
  std::vector<std::string> paths;
  bool asJson = false;
};

std::string beginningOf(const std::string &path) {
  InputFile file(path);
  std::string bytes(longestSignature, '\0');
  std::size_t length = 0;
  while (const std::size_t got = file.read(bytes.data() + length, bytes.size() - length)) {
    length += got;
  }
  bytes.resize(length);
  return bytes;
}

// Appends the facts about a file. Returns the exit code for it.
int detect(const std::string &path, Answer &answer) {
  try {
    const std::string bytes = beginningOf(path);
    int32_t length = 0;
    int32_t status = 0;
    const char *name = NLS2_detectUnicodeSignature(bytes.data(), static_cast<int32_t>(bytes.size()),
                                                   &length, &status);
    if (status > 0) {
      throw failure("{}: {}", printable(path), statusText(status));
    }
    answer.text +=
        fmt::format("{}: {}\n", printable(path),
                    name != nullptr ? fmt::format("{}, {} bytes", name, length) : "no signature");
    answer.json.append(
        Json::object({{"file", path}, {"encoding", name}, {"signature_length", length}}));
    return name != nullptr ? exitDone : exitFailed;
  } catch (const Error &error) {
    complain(error.what());
    answer.json.append(Json::object(
        {{"file", path}, {"encoding", nullptr}, {"signature_length", 0}, {"error", error.what()}}));
    return exitUsage;
  }
}

int detectAll(const Arguments &arguments) {
  Answer answer{"", Json::array()};
  int code = exitDone;
  for (const std::string &path : arguments.paths) {
    code = std::max(code, detect(path, answer));
  }
  print(answer.rendered(arguments.asJson));
  return code;
}

} // namespace

Command detectCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {.operands = {{"FILE", "files to examine; - is standard input", into(arguments->paths), 1,
                        Operand::anyNumber}},
          .options = {flag("json", "write JSON", into(arguments->asJson))},
          .notes = notes,
          .run = [arguments] { return detectAll(*arguments); }};
}

} // namespace nls2::tool
