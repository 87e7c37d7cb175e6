// SPDX-License-Identifier: MIT
// Calls of the system that fail when a test wants it, loaded before the C library: QUARZEL_FAILING names one
// and the number of the call at which it fails, counted from 1, or from which on: "write 3" or "write 3+".
// The file that QUARZEL_FAILED names is made then.
#include <dlfcn.h>
#include <fcntl.h>
#include <pthread.h>
#include <spawn.h>
#include <stdio.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <cstdarg>
#include <cstdlib>
#include <cstring>

namespace {

/// Whether this call of a function has to fail.
bool fails(const char* name) {
    const char* wanted = std::getenv("QUARZEL_FAILING");
    const std::size_t size = std::strlen(name);
    if (wanted == nullptr || std::strncmp(wanted, name, size) != 0 || wanted[size] != ' ') {
        return false;
    }
    static std::atomic<long> calls = 0;
    char* end = nullptr;
    const long first = std::strtol(wanted + size, &end, 10);
    const long call = ++calls;
    if (call != first && (call < first || *end != '+')) {
        return false;
    }
    ::syscall(SYS_close, ::syscall(SYS_creat, std::getenv("QUARZEL_FAILED"), 0600));
    return true;
}

}  // namespace

// A function of the C library that fails with an error number and a result.
#define QUARZEL_FAILING(type, name, error, result, parameters, ...)                               \
    extern "C" type name parameters {                                                             \
        if (fails(#name)) {                                                                       \
            errno = error;                                                                        \
            return result;                                                                        \
        }                                                                                         \
        static const auto real = reinterpret_cast<type(*) parameters>(::dlsym(RTLD_NEXT, #name)); \
        return real(__VA_ARGS__);                                                                 \
    }

QUARZEL_FAILING(FILE*, fopen64, EMFILE, nullptr, (const char* name, const char* mode), name, mode)
QUARZEL_FAILING(int, mkostemp, EACCES, -1, (char* name, int flags), name, flags)
QUARZEL_FAILING(char*, mkdtemp, EACCES, nullptr, (char* name), name)
QUARZEL_FAILING(int, mkdir, ENOSPC, -1, (const char* name, mode_t mode), name, mode)
QUARZEL_FAILING(ssize_t, write, ENOSPC, -1, (int file, const void* bytes, size_t size), file, bytes, size)
QUARZEL_FAILING(ssize_t, pwrite, ENOSPC, -1, (int file, const void* bytes, size_t size, off_t at), file,
                bytes, size, at)
QUARZEL_FAILING(int, ftruncate, EIO, -1, (int file, off_t size), file, size)
QUARZEL_FAILING(int, fchmod, EPERM, -1, (int file, mode_t mode), file, mode)
QUARZEL_FAILING(int, chmod, EPERM, -1, (const char* name, mode_t mode), name, mode)
QUARZEL_FAILING(int, fsync, EIO, -1, (int file), file)
QUARZEL_FAILING(int, syncfs, EIO, -1, (int file), file)
QUARZEL_FAILING(int, flock, ENOLCK, -1, (int file, int operation), file, operation)
QUARZEL_FAILING(int, rename, EIO, -1, (const char* from, const char* to), from, to)
QUARZEL_FAILING(int, renameat2, EIO, -1, (int a, const char* from, int b, const char* to, unsigned flags), a,
                from, b, to, flags)
QUARZEL_FAILING(int, pthread_create, EAGAIN, EAGAIN,
                (pthread_t * thread, const pthread_attr_t* attributes, void* (*start)(void*), void* argument),
                thread, attributes, start, argument)
QUARZEL_FAILING(int, memfd_create, EMFILE, -1, (const char* name, unsigned flags), name, flags)
QUARZEL_FAILING(int, posix_spawnp, EAGAIN, EAGAIN,
                (pid_t * child, const char* file, const posix_spawn_file_actions_t* actions,
                 const posix_spawnattr_t* attributes, char* const argv[], char* const environment[]),
                child, file, actions, attributes, argv, environment)

// As functions of a variable number of arguments these two are written out.
#define QUARZEL_FAILING_OPEN(name, directory) \
    if (fails(#name)) {                       \
        errno = EMFILE;                       \
        return -1;                            \
    }                                         \
    va_list more;                             \
    va_start(more, flags);                    \
    const auto mode = va_arg(more, mode_t);   \
    va_end(more);                             \
    return static_cast<int>(::syscall(SYS_openat, directory, file, flags, mode))

extern "C" int openat(int directory, const char* file, int flags, ...) {
    QUARZEL_FAILING_OPEN(openat, directory);
}

extern "C" int open(const char* file, int flags, ...) {
    QUARZEL_FAILING_OPEN(open, AT_FDCWD);
}

// The descriptor is closed all the same.
extern "C" int close(int file) {
    const long result = ::syscall(SYS_close, file);
    if (fails("close")) {
        errno = EIO;
        return -1;
    }
    return static_cast<int>(result);
}
