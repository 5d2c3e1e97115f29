// nls2 detect: which Unicode signature files begin with.

#include "commands.h"
#include "errors.h"
#include "io/input_file.h"
#include "io/output_file.h"
#include "nls2.h"

#include <array>
#include <fmt/core.h>
#include <memory>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace nls2::tool {

namespace {

using Json = nlohmann::ordered_json;

constexpr std::size_t longestSignature = 5;

constexpr const char *notes =
    R"(Without a signature a file may still be Unicode. FF FE 00 00 is UTF-32LE, even where a text in
UTF-16LE begins with a null.
Exit codes: 0 every file has a signature, 1 some file has none, 2 something went wrong.
)";

struct Arguments {
  std::vector<std::string> paths;
  bool asJson = false;
};

std::string beginningOf(const std::string &path) {
  InputFile file(path);
  std::array<char, longestSignature> buffer;
  std::size_t length = 0;
  std::size_t got = 0;
  while ((got = file.read(buffer.data() + length, buffer.size() - length, -1)) > 0) {
    length += got;
  }
  return {buffer.data(), length};
}

Json detect(const std::string &path) {
  const std::string bytes = beginningOf(path);
  int32_t length = 0;
  int32_t status = 0;
  const char *name = NLS2_detectUnicodeSignature(bytes.data(), static_cast<int32_t>(bytes.size()),
                                                 &length, &status);
  if (status > 0) {
    throw failure("{}: {}", path, statusText(status));
  }
  return {{"file", path},
          {"encoding", name != nullptr ? Json(name) : Json()},
          {"signatureLength", length}};
}

std::string asText(const Json &rows) {
  std::string text;
  for (const Json &row : rows) {
    const Json &encoding = row["encoding"];
    text += row["file"].get<std::string>() + ": ";
    text += encoding.is_null() ? "no signature\n"
                               : fmt::format("{}, {} bytes\n", encoding.get<std::string>(),
                                             row["signatureLength"].get<int32_t>());
  }
  return text;
}

// Names of files need not be UTF-8, which JSON must be.
std::string asJsonText(const Json &rows) {
  return rows.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

int detectAll(const Arguments &arguments) {
  Json rows = Json::array();
  int code = exitDone;
  for (const std::string &path : arguments.paths) {
    try {
      rows.push_back(detect(path));
      if (code == exitDone && rows.back()["encoding"].is_null()) {
        code = exitFailed;
      }
    } catch (const Error &error) {
      complain(error.what());
      code = exitUsage;
    }
  }
  OutputFile("-").write(arguments.asJson ? asJsonText(rows) : asText(rows));
  return code;
}

} // namespace

Command detectCommand() {
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {{"FILE", "files to look at; - is standard input", into(arguments->paths), 1,
                       Operand::anyNumber}};
  command.options = {{.name = "json", .help = "write JSON", .take = into(arguments->asJson)}};
  command.notes = notes;
  command.run = [arguments] { return detectAll(*arguments); };
  return command;
}

} // namespace nls2::tool
