// SPDX-License-Identifier: MIT
#include "files/file_lock.hpp"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>
#include <string_view>
#include <thread>

#include "files/open_file.hpp"
#include "files/output_file.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// What a lock file begins with, so that no other file is taken for one.
constexpr std::string_view mark = "quarzel lock: ";

/// Who holds a lock, in its file.
std::string ownText() {
    std::array<char, 256> host{};
    ::gethostname(host.data(), host.size() - 1);
    return fmt::format("{}process {} on {}\n", mark, ::getpid(), host.data());
}

std::string contentOf(int descriptor) {
    std::array<char, 512> text{};
    const ssize_t size = ::pread(descriptor, text.data(), text.size(), 0);
    return {text.data(), size > 0 ? static_cast<std::size_t>(size) : 0};
}

/// Whether the name still leads to the open file: the process that held it before may have removed it.
bool isStillThere(int descriptor, const std::string& name) {
    struct stat opened {};
    struct stat named {};
    return ::fstat(descriptor, &opened) == 0 && ::lstat(name.c_str(), &named) == 0 &&
           opened.st_dev == named.st_dev && opened.st_ino == named.st_ino;
}

/// Whether another process holds the lock and keeps it. One that was killed may need a moment to let go.
bool isHeld(int descriptor) {
    constexpr int attempts = 40;
    for (int attempt = 0; attempt < attempts; ++attempt) {
        if (::flock(descriptor, LOCK_EX | LOCK_NB) == 0 || errno != EWOULDBLOCK) {
            return false;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
    }
    return true;
}

/// Open the file of a lock and take it.
/// @param file  what it is for
/// @throws ToolError when another process holds it
int openLocked(const std::string& name, const std::string& file) {
    const int descriptor = ::open(name.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0666);
    if (descriptor < 0) {
        throw writeError(name);
    }
    const bool isTaken = isHeld(descriptor);
    const std::string content = contentOf(descriptor);
    const bool isForeign = !content.empty() && !content.starts_with(mark);
    if (!isTaken && !isForeign) {
        return descriptor;
    }
    ::close(descriptor);
    if (isForeign) {
        throw fileError(name, "is not a lock of quarzel", "move it away");
    }
    const std::string holder = content.substr(std::min(content.size(), mark.size()));
    throw fileError(file,
                    fmt::format("is in use by {}",
                                holder.empty() ? "another process" : holder.substr(0, holder.find('\n'))),
                    "wait for its end, or give another name");
}

}  // namespace

FileLock::FileLock(const std::string& file)
    : itsName(file + ".lock"), itsDescriptor(openLocked(itsName, file)) {
    while (!isStillThere(itsDescriptor, itsName)) {
        ::close(itsDescriptor);
        itsDescriptor = openLocked(itsName, file);
    }
    // Without room for the text the lock holds nonetheless.
    const std::string text = ownText();
    if (::ftruncate(itsDescriptor, 0) == 0) {
        [[maybe_unused]] const ssize_t ignored = ::pwrite(itsDescriptor, text.data(), text.size(), 0);
    }
}

FileLock::~FileLock() {
    ::unlink(itsName.c_str());
    ::close(itsDescriptor);
}

std::unique_ptr<FileLock> lockOutput(const std::optional<std::string>& output) {
    return output && isWhole(*output) ? std::make_unique<FileLock>(*output) : nullptr;
}

}  // namespace quarzel::tool
