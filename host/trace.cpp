// The default trace facility: one line per event, to a file or to standard error.
//
// It is off unless these environment variables are set when the process starts:   ZELHOST_TRACE
// "events", "detail" or "all": what to write   ZELHOST_TRACE_FILE  the file to append to; standard
// error if it is not set

#include "trc1.h"

#include <cerrno>
#include <cinttypes>
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <pthread.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

uint32_t flagsOf(const char *request) {
  if (request == nullptr || *request == '\0') {
    return 0;
  }
  if (std::strcmp(request, "events") == 0) {
    return TRC1_FLAG_EVENTS;
  }
  if (std::strcmp(request, "detail") == 0) {
    return TRC1_FLAG_DETAIL;
  }
  if (std::strcmp(request, "all") == 0) {
    return TRC1_FLAG_EVENTS | TRC1_FLAG_DETAIL;
  }
  std::fprintf(stderr, "zelhost: ZELHOST_TRACE is \"%s\"; it may be events, detail or all\n",
               request);
  return 0;
}

FILE *openedFile(const char *path) {
  if (path == nullptr || *path == '\0') {
    return stderr;
  }
  FILE *file = std::fopen(path, "ae");
  if (file == nullptr) {
    std::fprintf(stderr, "zelhost: cannot open ZELHOST_TRACE_FILE \"%s\": %s\n", path,
                 std::strerror(errno));
    return stderr;
  }
  return file;
}

// Read once, by the first call of any function of the library.
struct Settings {
  uint32_t flags;
  FILE *file;
};

Settings theSettings;
pthread_once_t theSettingsAreRead = PTHREAD_ONCE_INIT;

void readSettings() {
  theSettings.flags = flagsOf(secure_getenv("ZELHOST_TRACE"));
  theSettings.file =
      theSettings.flags != 0 ? openedFile(secure_getenv("ZELHOST_TRACE_FILE")) : stderr;
}

const Settings &settings() {
  pthread_once(&theSettingsAreRead, readSettings);
  return theSettings;
}

// One line: the constructor writes what all lines begin with, the destructor ends the line. Lines
// of several threads do not mix, since the stream stays locked in between. Thread cancellation is
// disabled meanwhile: writing is a cancellation point, and a cancelled thread would leave the
// stream locked for ever.
class Line {
public:
  Line(const TRC1_EntryBlock *anchor, uint32_t line) : file_(settings().file) {
    timespec now{};
    clock_gettime(CLOCK_REALTIME, &now);
    tm day{};
    gmtime_r(&now.tv_sec, &day);
    char date[sizeof "2007-03-09T19:13:31"];
    std::strftime(date, sizeof date, "%Y-%m-%dT%H:%M:%S", &day);
    pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &cancelState_);
    flockfile(file_);
    std::fprintf(file_, "%s.%06ldZ %ld %.*s:%" PRIu32 " ", date, now.tv_nsec / 1000,
                 syscall(SYS_gettid), static_cast<int>(anchor->functionNameLength),
                 anchor->functionName, line);
  }
  ~Line() {
    std::fputc('\n', file_);
    std::fflush(file_);
    funlockfile(file_);
    pthread_setcancelstate(cancelState_, nullptr);
  }
  Line(const Line &) = delete;
  Line &operator=(const Line &) = delete;

  FILE *file() const { return file_; }

private:
  FILE *file_;
  int cancelState_ = 0;
};

// A detail line's text without its newline; a newline inside would break the line in two.
void writeText(FILE *file, const char *format, va_list arguments) {
  char *text = nullptr;
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-nonliteral"
  const int length = vasprintf(&text, format, arguments);
#pragma GCC diagnostic pop
  if (length < 0) {
    std::fputs("(no memory for this line)", file);
    return;
  }
  for (const char *c = text; c[0] != '\0' && !(c[0] == '\n' && c[1] == '\0'); ++c) {
    std::fputc(*c == '\n' ? ' ' : *c, file);
  }
  std::free(text);
}

} // namespace

uint32_t TRC1_Sync(TRC1_EntryBlock *anchor) {
  const uint32_t flags = settings().flags;
  const uint32_t *sync = __atomic_load_n(&anchor->sync, __ATOMIC_RELAXED);
  __atomic_store_n(&anchor->cachedFlags, flags, __ATOMIC_RELAXED);
  __atomic_store_n(&anchor->cachedSync, __atomic_load_n(sync, __ATOMIC_RELAXED), __ATOMIC_RELEASE);
  return flags;
}

void TRC1_Event(TRC1_EntryBlock *anchor, uint32_t line, uint32_t kind, ...) {
  const Line out(anchor, line);
  if (kind == TRC1_EVENT_EXIT_VALUE) {
    va_list arguments;
    va_start(arguments, kind);
    const auto value = va_arg(arguments, uint32_t);
    va_end(arguments);
    std::fprintf(out.file(), "exit %" PRId32 " (0x%08" PRIX32 ")", static_cast<int32_t>(value),
                 value);
  } else {
    std::fputs(kind == TRC1_EVENT_ENTRY ? "entry" : "exit", out.file());
  }
}

void TRC1_Printf(TRC1_EntryBlock *anchor, uint32_t line, const char *format, ...) {
  const Line out(anchor, line);
  va_list arguments;
  va_start(arguments, format);
  writeText(out.file(), format, arguments);
  va_end(arguments);
}

void TRC1_Dump(TRC1_EntryBlock *anchor, uint32_t line, const void *address, uint32_t length,
               uint32_t /*zero*/) {
  const Line out(anchor, line);
  std::fprintf(out.file(), "dump of %" PRIu32 " bytes at %p:", length, address);
  const auto *bytes = static_cast<const unsigned char *>(address);
  for (uint32_t i = 0; i < length; ++i) {
    std::fprintf(out.file(), " %02X", bytes[i]);
  }
}
