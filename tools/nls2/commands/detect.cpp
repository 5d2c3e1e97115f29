// nls2 detect: which Unicode signatures files begin with.

#include "commands.h"
#include "io/input_file.h"
#include "io/print.h"
#include "json.h"
#include "nls2.h"

#include <array>
#include <memory>

namespace nls2::tool {

namespace {

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

struct Signature {
  std::string file;
  std::optional<std::string> encoding;
  int32_t length = 0;
  std::optional<std::string> error; // why the file could not be looked at
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

Signature detect(const std::string &path) {
  Signature found{.file = path, .encoding = {}, .error = {}};
  try {
    const std::string bytes = beginningOf(path);
    int32_t status = 0;
    const char *name = NLS2_detectUnicodeSignature(bytes.data(), static_cast<int32_t>(bytes.size()),
                                                   &found.length, &status);
    if (status > 0) {
      throw failure("{}: {}", printable(path), statusText(status));
    }
    found.encoding = name != nullptr ? std::optional<std::string>(name) : std::nullopt;
  } catch (const Error &error) {
    found.error = error.what();
  }
  return found;
}

std::string asText(const std::vector<Signature> &signatures) {
  std::string text;
  for (const Signature &found : signatures) {
    if (!found.error) {
      text += printable(found.file) + ": ";
      text += found.encoding ? fmt::format("{}, {} bytes\n", *found.encoding, found.length)
                             : "no signature\n";
    }
  }
  return text;
}

Json asJson(const std::vector<Signature> &signatures) {
  Json rows = Json::array();
  for (const Signature &found : signatures) {
    Json row = Json::object();
    row.set("file", found.file);
    row.set("encoding", found.encoding);
    row.set("signatureLength", found.length);
    if (found.error) {
      row.set("error", found.error);
    }
    rows.append(std::move(row));
  }
  return rows;
}

int detectAll(const Arguments &arguments) {
  std::vector<Signature> signatures;
  int code = exitDone;
  for (const std::string &path : arguments.paths) {
    const Signature &found = signatures.emplace_back(detect(path));
    if (found.error) {
      complain(found.error->c_str());
      code = exitUsage;
    } else if (!found.encoding && code == exitDone) {
      code = exitFailed;
    }
  }
  print(arguments.asJson ? asJson(signatures).text() : asText(signatures));
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
