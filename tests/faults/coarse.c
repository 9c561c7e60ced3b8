// A library that is preloaded into a program and shows it a file system that keeps times in steps of two seconds.
#define _GNU_SOURCE
#include <dlfcn.h>
#include <fcntl.h>
#include <sys/stat.h>

#define COARSE(name, parameters, arguments)                              \
  int name parameters {                                                  \
    static int (*real) parameters;                                       \
    if (!real) real = (int (*) parameters)dlsym(RTLD_NEXT, #name);       \
    const int result = real arguments;                                   \
    if (result == 0) {                                                   \
      out->st_mtim.tv_sec -= out->st_mtim.tv_sec % 2;                    \
      out->st_mtim.tv_nsec = 0;                                          \
    }                                                                    \
    return result;                                                       \
  }
COARSE(stat, (const char* path, struct stat* out), (path, out))
COARSE(lstat, (const char* path, struct stat* out), (path, out))
COARSE(fstat, (int fd, struct stat* out), (fd, out))
COARSE(fstatat, (int folder, const char* path, struct stat* out, int flags), (folder, path, out, flags))
