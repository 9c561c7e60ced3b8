/* A library that is preloaded into the tool and lets one of its system calls go wrong.
 *
 * FAULT_CALL   which calls are counted: a name of kNames
 * FAULT_AT     the number of the call that goes wrong, from 1; 0 or unset: none does
 * FAULT_HOW    fail (with FAULT_ERRNO), short (reads and writes: half of what was asked), kill (the process, ahead of
 *              the call)
 * FAULT_ERRNO  the number of the error
 * FAULT_STICKS set: all calls of the kind behind the one that failed fail too
 * FAULT_WHO    keeper: the calls of the process that the tool forks to run tools, not those of the one that was started
 * FAULT_COUNTS a file that gets "NAME COUNT" lines when the process ends
 *
 * The first four may be lists, separated by commas: several faults in one run.
 * Calls that the C library makes inside itself are not seen; so the stream functions are counted as calls of their own.
 * The tools that are run are not concerned. */
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
            FCLOSE, FORK, SEND, RECV, WAITPID, CALLS };
static const char* const kNames[CALLS] = {"open",  "read",    "write",   "close", "stat",   "rename", "unlink", "mkdir", "chmod",
                                          "utime", "opendir", "readdir", "fopen", "fwrite", "fflush", "fclose", "fork", "send", "recv", "waitpid"};

static atomic_long counts[CALLS];
static struct Fault {
  int call, error, is_short, kills;
  long at;
} faults[4];
static int fault_count, sticks, generation; /* 0: the process that was started, 1: its keeper, 2: a tool */
static int faulty_generation;
static __thread int error_number, is_short; /* of the call that goes wrong */
static const char* counts_path;

/* The n-th part of a list. */
static const char* part(const char* list, int n, char* buffer, size_t size) {
  for (; list && n > 0; --n) {
    list = strchr(list, ',');
    if (list) ++list;
  }
  if (!list || !*list) return NULL;
  snprintf(buffer, size, "%.*s", (int)strcspn(list, ","), list);
  return buffer;
}

static void read_settings(void) {
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
  sticks = getenv("FAULT_STICKS") != NULL;
  unsetenv("LD_PRELOAD"); /* the tools that it runs are left alone */
}

__attribute__((constructor)) static void begin(void) { read_settings(); }

__attribute__((destructor)) static void end(void) {
  if (!counts_path || generation != 0) return;
  FILE* (*open_stream)(const char*, const char*) = (FILE * (*)(const char*, const char*)) dlsym(RTLD_NEXT, "fopen");
  int (*close_stream)(FILE*) = (int (*)(FILE*))dlsym(RTLD_NEXT, "fclose");
  FILE* out = open_stream(counts_path, "w");
  if (!out) return;
  for (int i = 0; i < CALLS; ++i) fprintf(out, "%s %ld\n", kNames[i], atomic_load(&counts[i]));
  close_stream(out);
}

/* Whether this call is one that goes wrong. */
static int goes_wrong(enum Call call) {
  if (generation != faulty_generation) return 0;
  const long number = atomic_fetch_add(&counts[call], 1) + 1;
  for (int i = 0; i < fault_count; ++i) {
    const struct Fault* fault = &faults[i];
    if (fault->call != (int)call || fault->at <= 0) continue;
    if (number != fault->at && !(sticks && number > fault->at)) continue;
    if (fault->kills) kill(getpid(), SIGKILL);
    error_number = fault->error;
    is_short = fault->is_short;
    return 1;
  }
  return 0;
}

#define REAL(result, name, ...)                                    \
  static result (*real)(__VA_ARGS__);                              \
  if (!real) real = (result (*)(__VA_ARGS__))dlsym(RTLD_NEXT, name)

#define FAILS(call, result)        \
  if (goes_wrong(call)) {          \
    errno = error_number;          \
    return result;                 \
  }

static mode_t mode_of(int flags, va_list rest) { return flags & (O_CREAT | O_TMPFILE) ? va_arg(rest, mode_t) : 0; }

#define DEFINE_OPEN(name)                              \
  int name(const char* path, int flags, ...) {         \
    REAL(int, #name, const char*, int, ...);           \
    va_list rest;                                      \
    va_start(rest, flags);                             \
    const mode_t mode = mode_of(flags, rest);          \
    va_end(rest);                                      \
    FAILS(OPEN, -1)                                    \
    return real(path, flags, mode);                    \
  }
DEFINE_OPEN(open)
DEFINE_OPEN(open64)

ssize_t read(int fd, void* data, size_t size) {
  REAL(ssize_t, "read", int, void*, size_t);
  if (goes_wrong(READ)) {
    if (is_short) return real(fd, data, size / 2);
    errno = error_number;
    return -1;
  }
  return real(fd, data, size);
}

ssize_t write(int fd, const void* data, size_t size) {
  REAL(ssize_t, "write", int, const void*, size_t);
  if (fd > STDERR_FILENO && goes_wrong(WRITE)) {
    if (is_short) return real(fd, data, size / 2);
    errno = error_number;
    return -1;
  }
  return real(fd, data, size);
}

int close(int fd) { /* closes all the same, as the system does */
  REAL(int, "close", int);
  const int result = real(fd);
  FAILS(CLOSE, -1)
  return result;
}

#define DEFINE_STAT(name, type)                 \
  int name(const char* path, struct type* out) { \
    REAL(int, #name, const char*, struct type*); \
    FAILS(STAT, -1)                              \
    return real(path, out);                      \
  }
DEFINE_STAT(stat, stat)
DEFINE_STAT(stat64, stat64)
DEFINE_STAT(lstat, stat)

int fstat(int fd, struct stat* out) {
  REAL(int, "fstat", int, struct stat*);
  FAILS(STAT, -1)
  return real(fd, out);
}

int fstatat(int folder, const char* path, struct stat* out, int flags) {
  REAL(int, "fstatat", int, const char*, struct stat*, int);
  FAILS(STAT, -1)
  return real(folder, path, out, flags);
}

int rename(const char* from, const char* to) {
  REAL(int, "rename", const char*, const char*);
  FAILS(RENAME, -1)
  return real(from, to);
}

int unlink(const char* path) {
  REAL(int, "unlink", const char*);
  FAILS(UNLINK, -1)
  return real(path);
}

int mkdir(const char* path, mode_t mode) {
  REAL(int, "mkdir", const char*, mode_t);
  FAILS(MKDIR, -1)
  return real(path, mode);
}

int chmod(const char* path, mode_t mode) {
  REAL(int, "chmod", const char*, mode_t);
  FAILS(CHMOD, -1)
  return real(path, mode);
}

int utimensat(int folder, const char* path, const struct timespec times[2], int flags) {
  REAL(int, "utimensat", int, const char*, const struct timespec*, int);
  FAILS(UTIME, -1)
  return real(folder, path, times, flags);
}

DIR* opendir(const char* path) {
  REAL(DIR*, "opendir", const char*);
  FAILS(OPENDIR, NULL)
  return real(path);
}

struct dirent* readdir(DIR* folder) {
  REAL(struct dirent*, "readdir", DIR*);
  FAILS(READDIR, NULL)
  return real(folder);
}

#define DEFINE_FOPEN(name)                              \
  FILE* name(const char* path, const char* mode) {      \
    REAL(FILE*, #name, const char*, const char*);       \
    FAILS(FOPEN, NULL)                                  \
    return real(path, mode);                            \
  }
DEFINE_FOPEN(fopen)
DEFINE_FOPEN(fopen64)

size_t fwrite(const void* data, size_t size, size_t count, FILE* stream) {
  REAL(size_t, "fwrite", const void*, size_t, size_t, FILE*);
  if (goes_wrong(FWRITE)) {
    if (is_short) return real(data, size, count / 2, stream);
    errno = error_number;
    return 0;
  }
  return real(data, size, count, stream);
}

int fflush(FILE* stream) { /* what was buffered is lost */
  REAL(int, "fflush", FILE*);
  if (goes_wrong(FFLUSH)) {
    __fpurge(stream);
    errno = error_number;
    return EOF;
  }
  return real(stream);
}

int fclose(FILE* stream) { /* closes all the same; what was buffered is lost */
  REAL(int, "fclose", FILE*);
  const int wrong = goes_wrong(FCLOSE);
  if (wrong) __fpurge(stream);
  const int result = real(stream);
  if (!wrong) return result;
  errno = error_number;
  return EOF;
}

pid_t fork(void) {
  REAL(pid_t, "fork", void);
  FAILS(FORK, -1)
  const pid_t child = real();
  if (child == 0) ++generation;
  return child;
}

pid_t vfork(void) { return fork(); } /* a function that is called in between could not return into the caller twice */

ssize_t send(int socket, const void* data, size_t size, int flags) {
  REAL(ssize_t, "send", int, const void*, size_t, int);
  FAILS(SEND, -1)
  return real(socket, data, size, flags);
}

ssize_t sendmsg(int socket, const struct msghdr* message, int flags) {
  REAL(ssize_t, "sendmsg", int, const struct msghdr*, int);
  FAILS(SEND, -1)
  return real(socket, message, flags);
}

ssize_t recvmsg(int socket, struct msghdr* message, int flags) {
  REAL(ssize_t, "recvmsg", int, struct msghdr*, int);
  FAILS(RECV, -1)
  return real(socket, message, flags);
}

ssize_t recv(int socket, void* data, size_t size, int flags) {
  REAL(ssize_t, "recv", int, void*, size_t, int);
  FAILS(RECV, -1)
  return real(socket, data, size, flags);
}

pid_t waitpid(pid_t process, int* status, int flags) {
  REAL(pid_t, "waitpid", pid_t, int*, int);
  FAILS(WAITPID, -1)
  return real(process, status, flags);
}
