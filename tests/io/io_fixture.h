// What the tests of streams and bundles share: locale objects, a file of a test's own.
#pragma once

#include "nls2.h"

#include <cstdio>
#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <memory>
#include <string>
#include <unistd.h>

namespace io_test {

using LocalePointer = std::unique_ptr<NLS2_Locale, int32_t (*)(NLS2_Locale *)>;

inline LocalePointer makeLocale(const char *posixName) {
  int32_t status = 0;
  const uint32_t id = NLS2_LanguageIDFromShortPosixName(posixName, &status);
  LocalePointer locale(NLS2_GetLocale(id, 0, 0, &status), NLS2_ReleaseLocale);
  EXPECT_EQ(status, 0) << posixName;
  return locale;
}

// A path that no other test uses; what is there goes away with the object.
class TempFile {
public:
  TempFile() {
    static int count = 0;
    path_ =
        testing::TempDir() + "nls2_io_" + std::to_string(getpid()) + "_" + std::to_string(++count);
  }
  ~TempFile() { std::remove(path()); }
  TempFile(const TempFile &) = delete;
  TempFile &operator=(const TempFile &) = delete;

  const char *path() const { return path_.c_str(); }
  bool exists() const { return access(path(), F_OK) == 0; }
  void write(const std::string &bytes) const { std::ofstream(path_, std::ios::binary) << bytes; }
  std::string bytes() const {
    std::ifstream file(path_, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  }

private:
  std::string path_;
};

// Any address will do for an object that is not live.
inline const NLS2_Locale *deadLocale() {
  static const NLS2_Locale never{};
  return &never;
}

} // namespace io_test
