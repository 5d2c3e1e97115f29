// What a file keeps when another takes its place: owner, mode, access list, extended attributes.

#include "io/file_attributes.h"

#include "errors.h"

#include <cerrno>
#include <cstring>
#include <string_view>
#include <sys/xattr.h>
#include <unistd.h>

namespace nls2::tool {

namespace {

constexpr const char *accessList = "system.posix_acl_access";

// The size is asked for first and may grow until the second call: then it is asked for again.
template <typename Get>
std::string attributeBytes(Get get) {
  for (;;) {
    const ssize_t size = get(nullptr, 0);
    if (size <= 0) {
      return {};
    }
    std::string bytes(static_cast<std::size_t>(size), '\0');
    const ssize_t got = get(bytes.data(), bytes.size());
    if (got >= 0) {
      bytes.resize(static_cast<std::size_t>(got));
      return bytes;
    }
    if (errno != ERANGE) {
      return {};
    }
  }
}

std::string valueOf(const std::string &path, const char *name) {
  return attributeBytes(
      [&](char *buffer, std::size_t size) { return getxattr(path.c_str(), name, buffer, size); });
}

// Only the superuser may give a file away; its group may still be one of the caller's.
void copyOwner(const struct stat &from, int fd) {
  if (fchown(fd, from.st_uid, from.st_gid) != 0 &&
      fchown(fd, static_cast<uid_t>(-1), from.st_gid) != 0 && errno != EPERM) {
    throw failure("cannot keep the file's owner: {}", std::strerror(errno));
  }
}

void setMode(int fd, mode_t mode) {
  if (fchmod(fd, mode) != 0) {
    throw failure("cannot keep the file's permissions: {}", std::strerror(errno));
  }
}

// Where an access list is, the mode's group bits are its mask, which may allow more than the list
// allows the group. A file that cannot have the list is therefore the owner's alone. A list that
// the directory gave to the new file goes where the old one had none.
void copyMode(const std::string &path, const struct stat &from, int fd) {
  const std::string list = valueOf(path, accessList);
  if (list.empty()) {
    fremovexattr(fd, accessList);
    setMode(fd, from.st_mode & 0777);
    return;
  }
  setMode(fd, from.st_mode & 0700);
  static_cast<void>(fsetxattr(fd, accessList, list.data(), list.size(), 0));
}

// Capabilities are for the program that the old file was. Others that cannot be set are left out.
void copyOthers(const std::string &path, int fd) {
  const std::string names = attributeBytes(
      [&](char *buffer, std::size_t size) { return listxattr(path.c_str(), buffer, size); });
  for (const char *name = names.c_str(); name < names.data() + names.size();
       name += std::strlen(name) + 1) {
    if (name != std::string_view(accessList) && name != std::string_view("security.capability")) {
      const std::string value = valueOf(path, name);
      static_cast<void>(fsetxattr(fd, name, value.data(), value.size(), 0));
    }
  }
}

} // namespace

// The owner first, since a change of owner takes mode bits away.
void copyAttributes(const std::string &path, const struct stat &facts, int fd) {
  copyOwner(facts, fd);
  copyMode(path, facts, fd);
  copyOthers(path, fd);
}

} // namespace nls2::tool
