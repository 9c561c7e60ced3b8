// A library that is preloaded into the tool and lets one of its system calls go wrong.
//
// FAULT_CALL   which calls are counted: a name of kNames
// FAULT_AT     the number of the call that goes wrong, from 1; 0 or unset: none does
// FAULT_HOW    fail (with FAULT_ERRNO), short (reads and writes: half of what was asked), kill (the process, ahead of
//              the call)
// FAULT_ERRNO  the number of the error
// FAULT_WHO    keeper: the calls of the process that the tool forks to run tools, not those of the one that was started
// FAULT_COUNTS a file that gets "NAME COUNT" lines when the process ends
//
// The first four may be lists, separated by commas: several faults in one run.
// Calls that the C library makes inside itself are not seen; so the stream functions are counted as calls of their own.
// The tools that are run are not concerned.
#define _GNU_SOURCE
#include <dirent.h>
#include <dlfcn.h>
#include <errno.h>
#include <fcntl.h>
#include <signal.h>
#include <stdarg.h>
#include <stdatomic.h>
#include <stdio.h>
#include <stdio_ext.h>
#include <stdlib.h>
#include <string.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/types.h>
#include <sys/wait.h>
#include <unistd.h>

enum Call { OPEN, READ, WRITE, CLOSE, STAT, RENAME, UNLINK, MKDIR, CHMOD, UTIME, OPENDIR, READDIR, FOPEN, FWRITE, FFLUSH,
            FCLOSE, FORK, SEND, RECV, CALLS };
static const char* const kNames[CALLS] = {"open",  "read",    "write",   "close", "stat",   "rename", "unlink", "mkdir", "chmod",
                                          "utime", "opendir", "readdir", "fopen", "fwrite", "fflush", "fclose", "fork", "send", "recv"};

static atomic_long counts[CALLS];
static struct Fault {
  int call, error, is_short, kills;
  long at;
} faults[4];
static int fault_count, generation; // 0: the process that was started, 1: its keeper, 2: a tool
static int faulty_generation;
static __thread int error_number, is_short; // of the call that goes wrong
static const char* counts_path;

// The n-th part of a list.
static const char* part(const char* list, int n, char* buffer, size_t size) {
  for (; list && n > 0; --n) {
    list = strchr(list, ',');
    if (list) ++list;
  }
  if (!list || !*list) return NULL;
  snprintf(buffer, size, "%.*s", (int)strcspn(list, ","), list);
  return buffer;
}

__attribute__((constructor)) static void begin(void) {
  char buffer[64];
  const char *word, *who = getenv("FAULT_WHO");
  counts_path = getenv("FAULT_COUNTS");
  faulty_generation = who && strcmp(who, "keeper") == 0;
  for (; fault_count < 4 && (word = part(getenv("FAULT_CALL"), fault_count, buffer, sizeof buffer)); ++fault_count) {
    struct Fault* fault = &faults[fault_count];
    fault->call = -1;
    for (int i = 0; i < CALLS; ++i) {
      if (strcmp(word, kNames[i]) == 0) fault->call = i;
    }
    fault->at = (word = part(getenv("FAULT_AT"), fault_count, buffer, sizeof buffer)) ? atol(word) : 0;
    fault->error = (word = part(getenv("FAULT_ERRNO"), fault_count, buffer, sizeof buffer)) ? atoi(word) : EIO;
    word = part(getenv("FAULT_HOW"), fault_count, buffer, sizeof buffer);
    fault->kills = word && strcmp(word, "kill") == 0;
    fault->is_short = word && strcmp(word, "short") == 0;
  }
  unsetenv("LD_PRELOAD"); // the tools that it runs are left alone
}

__attribute__((destructor)) static void end(void) {
  if (!counts_path || generation != 0) return;
  FILE* (*open_stream)(const char*, const char*) = (FILE * (*)(const char*, const char*)) dlsym(RTLD_NEXT, "fopen");
  int (*close_stream)(FILE*) = (int (*)(FILE*))dlsym(RTLD_NEXT, "fclose");
  FILE* out = open_stream(counts_path, "w");
  if (!out) return;
  for (int i = 0; i < CALLS; ++i) fprintf(out, "%s %ld\n", kNames[i], atomic_load(&counts[i]));
  close_stream(out);
}

// Whether this call is one that goes wrong.
static int goes_wrong(enum Call call) {
  if (generation != faulty_generation) return 0;
  const long number = atomic_fetch_add(&counts[call], 1) + 1;
  for (int i = 0; i < fault_count; ++i) {
    const struct Fault* fault = &faults[i];
    if (fault->call != (int)call || fault->at != number) continue;
    if (fault->kills) kill(getpid(), SIGKILL);
    error_number = fault->error;
    is_short = fault->is_short;
    return 1;
  }
  return 0;
}

// The function that the program would have called.
#define REAL(type, name, parameters)                               \
  static type (*real) parameters;                                  \
  if (!real) real = (type (*) parameters)dlsym(RTLD_NEXT, #name)

// A function whose calls fail with `result`, or end short with `half` in place of their arguments.
#define SHORTENED(type, name, call, result, parameters, arguments, half) \
  type name parameters {                                                 \
    REAL(type, name, parameters);                                        \
    if (!goes_wrong(call)) return real arguments;                        \
    if (is_short) return real half;                                      \
    errno = error_number;                                                \
    return result;                                                       \
  }
#define FAILING(type, name, call, result, parameters, arguments) SHORTENED(type, name, call, result, parameters, arguments, arguments)

FAILING(int, stat, STAT, -1, (const char* path, struct stat* out), (path, out))
FAILING(int, stat64, STAT, -1, (const char* path, struct stat64* out), (path, out))
FAILING(int, lstat, STAT, -1, (const char* path, struct stat* out), (path, out))
FAILING(int, fstat, STAT, -1, (int fd, struct stat* out), (fd, out))
FAILING(int, fstatat, STAT, -1, (int folder, const char* path, struct stat* out, int flags), (folder, path, out, flags))
FAILING(int, rename, RENAME, -1, (const char* from, const char* to), (from, to))
FAILING(int, unlink, UNLINK, -1, (const char* path), (path))
FAILING(int, mkdir, MKDIR, -1, (const char* path, mode_t mode), (path, mode))
FAILING(int, chmod, CHMOD, -1, (const char* path, mode_t mode), (path, mode))
FAILING(int, utimensat, UTIME, -1, (int folder, const char* path, const struct timespec times[2], int flags), (folder, path, times, flags))
FAILING(DIR*, opendir, OPENDIR, NULL, (const char* path), (path))
FAILING(struct dirent*, readdir, READDIR, NULL, (DIR* folder), (folder))
FAILING(FILE*, fopen, FOPEN, NULL, (const char* path, const char* mode), (path, mode))
FAILING(FILE*, fopen64, FOPEN, NULL, (const char* path, const char* mode), (path, mode))
FAILING(ssize_t, send, SEND, -1, (int socket, const void* data, size_t size, int flags), (socket, data, size, flags))
FAILING(ssize_t, sendmsg, SEND, -1, (int socket, const struct msghdr* message, int flags), (socket, message, flags))
FAILING(ssize_t, recv, RECV, -1, (int socket, void* data, size_t size, int flags), (socket, data, size, flags))
FAILING(ssize_t, recvmsg, RECV, -1, (int socket, struct msghdr* message, int flags), (socket, message, flags))
SHORTENED(ssize_t, read, READ, -1, (int fd, void* data, size_t size), (fd, data, size), (fd, data, size / 2))
SHORTENED(size_t, fwrite, FWRITE, 0, (const void* data, size_t size, size_t count, FILE* stream), (data, size, count, stream),
          (data, size, count / 2, stream))

ssize_t write(int fd, const void* data, size_t size) {
  REAL(ssize_t, write, (int, const void*, size_t));
  if (fd <= STDERR_FILENO || !goes_wrong(WRITE)) return real(fd, data, size);
  if (is_short) return real(fd, data, size / 2);
  errno = error_number;
  return -1;
}

#define DEFINE_OPEN(name)                                                              \
  int name(const char* path, int flags, ...) {                                         \
    REAL(int, name, (const char*, int, ...));                                          \
    va_list rest;                                                                      \
    va_start(rest, flags);                                                             \
    const mode_t mode = flags & (O_CREAT | O_TMPFILE) ? va_arg(rest, mode_t) : 0;      \
    va_end(rest);                                                                      \
    if (!goes_wrong(OPEN)) return real(path, flags, mode);                             \
    errno = error_number;                                                              \
    return -1;                                                                         \
  }
DEFINE_OPEN(open)
DEFINE_OPEN(open64)

int close(int fd) {  // closes all the same, as the system does
  REAL(int, close, (int));
  const int result = real(fd);
  if (!goes_wrong(CLOSE)) return result;
  errno = error_number;
  return -1;
}

int fflush(FILE* stream) {  // what was buffered is lost
  REAL(int, fflush, (FILE*));
  if (!goes_wrong(FFLUSH)) return real(stream);
  __fpurge(stream);
  errno = error_number;
  return EOF;
}

int fclose(FILE* stream) {  // closes all the same; what was buffered is lost
  REAL(int, fclose, (FILE*));
  if (!goes_wrong(FCLOSE)) return real(stream);
  __fpurge(stream);
  real(stream);
  errno = error_number;
  return EOF;
}

pid_t fork(void) {
  REAL(pid_t, fork, (void));
  if (goes_wrong(FORK)) {
    errno = error_number;
    return -1;
  }
  const pid_t child = real();
  if (child == 0) ++generation;
  return child;
}

pid_t vfork(void) { return fork(); }  // a function that is called in between could not return into the caller twice
