// SPDX-License-Identifier: MIT
#include "small_disk.hpp"

#include <fcntl.h>
#include <sched.h>
#include <sys/mount.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <system_error>

namespace quarzel::test {

namespace {

int checked(int result, const char* what) {
    if (result < 0) {
        throw std::system_error(errno, std::generic_category(), what);
    }
    return result;
}

}  // namespace

SmallDisk::SmallDisk(int kibibytes) {
    checked(::unshare(CLONE_NEWNS), "a name space of mounts");
    checked(::mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr), "mounts of one's own");
    const std::string size = "size=" + std::to_string(kibibytes) + 'k';
    checked(::mount("none", path("").c_str(), "tmpfs", 0, size.c_str()), "a file system in memory");
}

SmallDisk::~SmallDisk() {
    ::umount2(path("").c_str(), MNT_DETACH);
}

void SmallDisk::fill() const {
    const int file =
        checked(::open(path("ballast").c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0600), "ballast");
    const std::array<char, 4096> page{};
    while (::write(file, page.data(), page.size()) > 0) {
    }
    const int cause = errno;
    ::close(file);
    if (cause != ENOSPC) {
        throw std::system_error(cause, std::generic_category(), "ballast");
    }
}

void SmallDisk::makeRoom() const {
    checked(::unlink(path("ballast").c_str()), "ballast");
}

}  // namespace quarzel::test
