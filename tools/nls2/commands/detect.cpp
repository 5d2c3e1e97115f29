// nls2 detect: which Unicode signatures files begin with.

#include "io/input_file.h"
#include "io/output_file.h"
#include "json.h"
#include "nls2.h"
#include "options.h"

#include <algorithm>
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
  std::string bytes(longestSignature, '\0');
  std::size_t length = 0;
  while (const std::size_t got = file.read(bytes.data() + length, bytes.size() - length)) {
    length += got;
  }
  bytes.resize(length);
  return bytes;
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
    complain(error.what());
  }
  return found;
}

std::string asText(const Signature &found) {
  return fmt::format("{}: {}\n", printable(found.file),
                     found.encoding ? fmt::format("{}, {} bytes", *found.encoding, found.length)
                                    : "no signature");
}

Json asJson(const Signature &found) {
  Json row = Json::object(
      {{"file", found.file}, {"encoding", found.encoding}, {"signatureLength", found.length}});
  return found.error ? row.set("error", found.error) : row;
}

int detectAll(const Arguments &arguments) {
  std::vector<Signature> signatures;
  std::string text;
  int code = exitDone;
  for (const std::string &path : arguments.paths) {
    const Signature &found = signatures.emplace_back(detect(path));
    code = std::max<int>(code, found.error ? exitUsage : found.encoding ? exitDone : exitFailed);
    text += found.error ? "" : asText(found);
  }
  print(arguments.asJson ? Json::array(signatures, asJson).text() : text);
  return code;
}

} // namespace

Command detectCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {.operands = {{"FILE", "files to look at; - is standard input", into(arguments->paths), 1,
                        Operand::anyNumber}},
          .options = {flag("json", "write JSON", into(arguments->asJson))},
          .notes = notes,
          .run = [arguments] { return detectAll(*arguments); }};
}

} // namespace nls2::tool
