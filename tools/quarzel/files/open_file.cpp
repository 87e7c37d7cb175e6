// SPDX-License-Identifier: MIT
#include "files/open_file.hpp"

#include <fcntl.h>
#include <fmt/format.h>
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
        default:
            return "choose another place";
    }
}

}  // namespace

ToolError writeError(const std::string& file) {
    const int cause = errno;
    return fileError(file, fmt::format("cannot be written: {}", std::strerror(cause)), remedyFor(cause));
}

OpenFile::OpenFile(const std::string& name, int flags, std::string shown)
    : itsDescriptor(::open(name.c_str(), O_WRONLY | O_CLOEXEC | flags, 0666)), itsShown(std::move(shown)) {
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
