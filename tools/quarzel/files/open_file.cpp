// SPDX-License-Identifier: MIT
#include "files/open_file.hpp"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <utility>

namespace quarzel::tool {

namespace {

const char* remedyFor(int cause) {
    switch (cause) {
        case ENOENT:
            return "create its directory first";
        case EACCES:
        case EPERM:
        case EROFS:
            return "choose a place that you may write to";
        case ENOSPC:
        case EDQUOT:
            return "free some space";
        case EFBIG:
            return "raise the limit (ulimit -f)";
        case ENAMETOOLONG:
            return "choose a shorter name";
        default:
            return "choose another place";
    }
}

}  // namespace

ToolError writeError(const std::string& file) {
    const int cause = errno;
    return fileError(file, fmt::format("cannot be written: {}", std::strerror(cause)), remedyFor(cause));
}

mode_t permissionsOfNew(mode_t wanted) {
    const mode_t mask = ::umask(0);
    ::umask(mask);
    return wanted & ~mask;
}

void probeRename(const std::string& target, const std::string& shown) {
    struct statx status {};
    if (::statx(AT_FDCWD, target.c_str(), AT_SYMLINK_NOFOLLOW, STATX_TYPE, &status) != 0) {
        if (errno != ENOENT) {
            throw writeError(shown);  // its name is too long, for example
        }
        return;
    }
    if ((status.stx_attributes & STATX_ATTR_MOUNT_ROOT) != 0) {
        errno = EBUSY;
        throw writeError(shown);
    }
    // To remove a file as a directory fails, and a directory as a file too. But the system first looks
    // whether it may be removed at all: another user's in a sticky directory, for example, may not.
    const bool isDirectory = S_ISDIR(status.stx_mode);
    const int result = isDirectory ? ::unlink(target.c_str()) : ::rmdir(target.c_str());
    if (result != 0 && errno != (isDirectory ? EISDIR : ENOTDIR)) {
        throw writeError(shown);
    }
}

void syncDirectory(const std::string& directory, const std::string& shown) {
    const int descriptor = ::open(directory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (descriptor < 0) {
        return;  // it may be written to and not read
    }
    // Some file systems cannot do this for directories and say so with EINVAL.
    const int cause = ::fsync(descriptor) == 0 ? 0 : errno;
    ::close(descriptor);
    if (cause != 0 && cause != EINVAL) {
        errno = cause;
        throw writeError(shown);
    }
}

OpenFile::OpenFile(const std::string& name, int flags, std::string shown)
    : OpenFile(::open(name.c_str(), O_WRONLY | O_CLOEXEC | flags, 0666), std::move(shown)) {}

OpenFile::OpenFile(int descriptor, std::string shown)
    : itsDescriptor(descriptor), itsShown(std::move(shown)) {
    if (itsDescriptor < 0) {
        throw writeError(itsShown);
    }
}

OpenFile::~OpenFile() {
    if (itsDescriptor >= 0) {
        ::close(itsDescriptor);
    }
}

void OpenFile::write(std::string_view bytes) {
    while (!bytes.empty()) {
        const ssize_t count = ::write(itsDescriptor, bytes.data(), bytes.size());
        if (count >= 0) {
            bytes.remove_prefix(static_cast<std::size_t>(count));
        } else if (errno != EINTR) {
            throw writeError(itsShown);
        }
    }
}

void OpenFile::setPermissions(mode_t permissions) {
    [[maybe_unused]] const int ignored = ::fchmod(itsDescriptor, permissions);
}

void OpenFile::sync() {
    if (::fsync(itsDescriptor) != 0) {
        throw writeError(itsShown);
    }
}

void OpenFile::close() {
    if (::close(std::exchange(itsDescriptor, -1)) != 0) {
        throw writeError(itsShown);
    }
}

}  // namespace quarzel::tool
