// SPDX-License-Identifier: MIT
#include "output_file.hpp"

#include <fcntl.h>
#include <fmt/format.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <utility>

#include "tool_error.hpp"

namespace fs = std::filesystem;

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

/// The error for the system call that has just failed.
ToolError writeError(const std::string& file) {
    const int cause = errno;
    return fileError(file, fmt::format("cannot be written: {}", std::strerror(cause)), remedyFor(cause));
}

/// A file open for writing.
class OpenFile {
  public:
    /// @param name   the file that is opened
    /// @param shown  its name for error messages
    OpenFile(const std::string& name, int flags, std::string shown)
        : itsDescriptor(::open(name.c_str(), O_WRONLY | O_CLOEXEC | flags, 0666)),
          itsShown(std::move(shown)) {
        if (itsDescriptor < 0) {
            throw writeError(itsShown);
        }
    }
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;
    ~OpenFile() {
        if (itsDescriptor >= 0) {
            ::close(itsDescriptor);
        }
    }

    void write(std::string_view bytes) {
        while (!bytes.empty()) {
            const ssize_t count = ::write(itsDescriptor, bytes.data(), bytes.size());
            if (count >= 0) {
                bytes.remove_prefix(static_cast<std::size_t>(count));
            } else if (errno != EINTR) {
                throw writeError(itsShown);
            }
        }
    }

    void sync() {
        if (::fsync(itsDescriptor) != 0) {
            throw writeError(itsShown);
        }
    }

    /// Some file systems report a full disk only here.
    void close() {
        if (::close(std::exchange(itsDescriptor, -1)) != 0) {
            throw writeError(itsShown);
        }
    }

  private:
    int itsDescriptor;
    std::string itsShown;
};

/// The file that a name stands for: links are followed, so that they stay links.
fs::path targetOf(const std::string& file) {
    std::error_code error;
    const fs::path target = fs::canonical(file, error);
    return error ? fs::path(file) : target;
}

bool isWrittenDirectly(const fs::path& target) {
    std::error_code ignored;
    return fs::exists(target, ignored) && !fs::is_regular_file(target, ignored);
}

}  // namespace

/// The open file: the output itself, or one beside it that vanishes unless it takes the output's place.
class OutputFile::Target {
  public:
    explicit Target(const std::string& shown)
        : itsTarget(targetOf(shown)),
          itsTemporaryName(isWrittenDirectly(itsTarget)
                               ? fs::path()
                               : itsTarget.parent_path() / fmt::format(".quarzel-{}.tmp", ::getpid())),
          itsShown(shown),
          itsFile(itsTemporaryName.empty() ? OpenFile(itsTarget.string(), 0, shown)
                                           : OpenFile(itsTemporaryName.string(), O_CREAT | O_EXCL, shown)) {}
    Target(const Target&) = delete;
    Target& operator=(const Target&) = delete;
    ~Target() {
        if (!itsTemporaryName.empty()) {
            ::unlink(itsTemporaryName.c_str());
        }
    }

    void write(std::string_view bytes) { itsFile.write(bytes); }

    void finish() {
        if (itsTemporaryName.empty()) {
            itsFile.close();
            return;
        }
        itsFile.sync();
        itsFile.close();
        if (::rename(itsTemporaryName.c_str(), itsTarget.c_str()) != 0) {
            throw writeError(itsShown);
        }
        itsTemporaryName.clear();
    }

  private:
    fs::path itsTarget;
    fs::path itsTemporaryName;  ///< empty: none
    std::string itsShown;
    OpenFile itsFile;
};

OutputFile::OutputFile(const std::string& file) : itsTarget(std::make_unique<Target>(file)) {}
OutputFile::~OutputFile() = default;

void OutputFile::write(std::string_view bytes) {
    itsTarget->write(bytes);
}

void OutputFile::finish() {
    itsTarget->finish();
}

bool isSameFile(const std::string& a, const std::string& b) {
    std::error_code ignored;
    const fs::path first = fs::weakly_canonical(a, ignored);
    return fs::equivalent(a, b, ignored) || (!first.empty() && first == fs::weakly_canonical(b, ignored));
}

void probeOutput(const std::string& file) {
    const fs::path target = targetOf(file);
    std::error_code ignored;
    if (fs::is_directory(target, ignored)) {
        throw fileError(file, "is a directory", "give the name of a file");
    }
    if (fs::exists(target, ignored) && ::access(target.c_str(), W_OK) != 0) {
        throw writeError(file);
    }
    if (!isWrittenDirectly(target)) {
        const OutputFile probe(file);
    }
}

void writeOutput(const std::string& file, std::string_view bytes) {
    OutputFile output(file);
    output.write(bytes);
    output.finish();
}

}  // namespace quarzel::tool
