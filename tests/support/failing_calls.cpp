// SPDX-License-Identifier: MIT
// Calls of the system that fail when a test wants it, loaded before the C library: QUARZEL_FAILING names one
// and the number of the call at which it fails, counted from 1 since it was set, or from which on: "write 3"
// or "write 3+". The file that QUARZEL_FAILED names is made then. With QUARZEL_FAILING_IN, a part of the path
// of a library, only calls from inside it count.
#include <dlfcn.h>
#include <execinfo.h>
#include <fcntl.h>
#include <link.h>
#include <pthread.h>
#include <spawn.h>
#include <stdio.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstdarg>
#include <cstdlib>
#include <cstring>
#include <mutex>

namespace {

/// Whether a function of the library is being called whose path has this part.
bool isInside(const char* part) {
    std::array<void*, 50> frames{};
    const int depth = ::backtrace(frames.data(), static_cast<int>(frames.size()));
    for (int i = 0; i < depth; ++i) {
        dl_find_object object{};
        if (::_dl_find_object(frames.at(static_cast<std::size_t>(i)), &object) == 0 &&
            std::strstr(object.dlfo_link_map->l_name, part) != nullptr) {
            return true;
        }
    }
    return false;
}

/// Count a call.
/// @param wanted  the value of QUARZEL_FAILING
/// @return        its number, from 1 after every change of the value
long count(const char* wanted) {
    static std::mutex mutex;
    static std::array<char, 64> last{};
    static long calls = 0;
    const std::lock_guard lock(mutex);
    if (std::strcmp(last.data(), wanted) != 0) {
        std::strncpy(last.data(), wanted, last.size() - 1);
        calls = 0;
    }
    return ++calls;
}

/// Whether this call of a function has to fail.
bool fails(const char* name) {
    const char* const wanted = std::getenv("QUARZEL_FAILING");
    const std::size_t size = std::strlen(name);
    if (wanted == nullptr || std::strncmp(wanted, name, size) != 0 || wanted[size] != ' ') {
        return false;
    }
    static thread_local bool isAsking = false;  // whoever looks at the calls may call itself
    if (isAsking) {
        return false;
    }
    isAsking = true;
    const char* const part = std::getenv("QUARZEL_FAILING_IN");
    const bool counts = part == nullptr || isInside(part);
    isAsking = false;
    if (!counts) {
        return false;
    }
    char* end = nullptr;
    const long first = std::strtol(wanted + size, &end, 10);
    const long call = count(wanted);
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

// The C library's own, as to look for the next one takes memory.
extern "C" void* __libc_malloc(size_t size);
extern "C" void* malloc(size_t size) {
    if (fails("malloc")) {
        errno = ENOMEM;
        return nullptr;
    }
    return __libc_malloc(size);
}
