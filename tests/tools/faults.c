/* System calls that fail, for LD_PRELOAD: the one that the variable FAULT names. */
#define _GNU_SOURCE
#include <dlfcn.h>
#include <errno.h>
#include <fcntl.h>
#include <pthread.h>
#include <stdarg.h>
#include <stdlib.h>
#include <string.h>
#include <sys/stat.h>
#include <unistd.h>

static int fails(const char *call, int error) {
  const char *fault = getenv("FAULT");
  errno = error;
  return fault != NULL && strcmp(fault, call) == 0;
}

/* Of a file that was written, as network file systems report lost bytes. */
int close(int fd) {
  const int written = (fcntl(fd, F_GETFL) & O_ACCMODE) == O_RDWR;
  const int result = ((int (*)(int))dlsym(RTLD_NEXT, "close"))(fd);
  return written && fails("close", ENOSPC) ? -1 : result;
}

int fsync(int fd) { return fd >= 0 && fails("fsync", EIO) ? -1 : 0; }

int stat(const char *path, struct stat *facts) {
  return fails("stat", EIO) ? -1 : fstatat(AT_FDCWD, path, facts, 0);
}

/* Every file system but a few has files without a name. */
int open(const char *path, int flags, ...) {
  va_list more;
  va_start(more, flags);
  const mode_t mode = va_arg(more, mode_t);
  va_end(more);
  return (flags & O_TMPFILE) == O_TMPFILE && fails("tmpfile", EOPNOTSUPP)
             ? -1
             : openat(AT_FDCWD, path, flags, mode);
}

int pthread_create(pthread_t *thread, const pthread_attr_t *attributes, void *(*run)(void *),
                   void *argument) {
  int (*const real)(pthread_t *, const pthread_attr_t *, void *(*)(void *), void *) =
      (int (*)(pthread_t *, const pthread_attr_t *, void *(*)(void *), void *))dlsym(
          RTLD_NEXT, "pthread_create");
  return fails("thread", EAGAIN) ? EAGAIN : real(thread, attributes, run, argument);
}
