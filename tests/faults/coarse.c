/* A library that is preloaded into a program and shows it a file system that keeps times in steps of two seconds. */
#define _GNU_SOURCE
#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>

static int coarsen(int result, struct stat* out) {
  if (result == 0) {
    out->st_mtim.tv_sec -= out->st_mtim.tv_sec % 2;
    out->st_mtim.tv_nsec = 0;
  }
  return result;
}

#define REAL(name, ...)                            \
  static int (*real)(__VA_ARGS__);                 \
  if (!real) real = (int (*)(__VA_ARGS__))dlsym(RTLD_NEXT, name)

#define DEFINE_STAT(name)                     \
  int name(const char* path, struct stat* out) { \
    REAL(#name, const char*, struct stat*);   \
    return coarsen(real(path, out), out);     \
  }
DEFINE_STAT(stat)
DEFINE_STAT(lstat)

int fstat(int fd, struct stat* out) {
  REAL("fstat", int, struct stat*);
  return coarsen(real(fd, out), out);
}

int fstatat(int folder, const char* path, struct stat* out, int flags) {
  REAL("fstatat", int, const char*, struct stat*, int);
  return coarsen(real(folder, path, out, flags), out);
}
