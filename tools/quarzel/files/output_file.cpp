// SPDX-License-Identifier: MIT
#include "files/output_file.hpp"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <filesystem>

#include "files/input_file.hpp"
#include "files/open_file.hpp"
#include "tool_error.hpp"

namespace fs = std::filesystem;

namespace quarzel::tool {

namespace {

/// The file that a name stands for: links are followed, so that they stay links, wherever they lead.
fs::path targetOf(const std::string& file) {
    constexpr int longestChain = 40;
    std::error_code ignored;
    fs::path target = file;
    for (int links = 0; fs::is_symlink(target, ignored); ++links) {
        if (links == longestChain) {
            errno = ELOOP;
            throw writeError(file);
        }
        target = target.parent_path() / fs::read_symlink(target, ignored);
    }
    return target;
}

bool isWrittenDirectly(const fs::path& target) {
    std::error_code ignored;
    return fs::exists(target, ignored) && !fs::is_regular_file(target, ignored);
}

/// What a name in the directory of a file begins with until the file takes its place.
std::string temporaryTemplate(const fs::path& target) {
    return (target.parent_path() / ".quarzel-XXXXXX").string();
}

/// The permissions of the file that is there, or else those of a new one.
mode_t permissionsOf(const fs::path& target) {
    struct stat status {};
    constexpr mode_t all = 07777;
    return ::stat(target.c_str(), &status) == 0 ? status.st_mode & all : permissionsOfNew(0666);
}

}  // namespace

/// The open file: the output itself, or one beside it that vanishes unless it takes the output's place.
class OutputFile::Target {
  public:
    explicit Target(const std::string& shown)
        : itsTarget(targetOf(shown)),
          itsTemporaryName(isStandardStream(shown) || isWrittenDirectly(itsTarget)
                               ? std::string()
                               : temporaryTemplate(itsTarget)),
          itsShown(shown),
          itsFile(open(), shown) {}
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
        itsFile.setPermissions(permissionsOf(itsTarget));
        itsFile.sync();
        itsFile.close();
        if (::rename(itsTemporaryName.c_str(), itsTarget.c_str()) != 0) {
            throw writeError(itsShown);
        }
        itsTemporaryName.clear();
        const fs::path directory = itsTarget.parent_path();
        syncDirectory(directory.empty() ? "." : directory.string(), itsShown);
    }

  private:
    int open() {
        if (isStandardStream(itsShown)) {
            return ::fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 0);
        }
        return itsTemporaryName.empty() ? ::open(itsTarget.c_str(), O_WRONLY | O_CLOEXEC)
                                        : ::mkostemp(itsTemporaryName.data(), O_CLOEXEC);
    }

    fs::path itsTarget;
    std::string itsTemporaryName;  ///< empty: none
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
    if (isStandardStream(a) || isStandardStream(b)) {
        return false;
    }
    std::error_code ignored;
    // Absolute first: of a relative name that is not there yet nothing would be canonical.
    const fs::path first = fs::weakly_canonical(fs::absolute(targetOf(a), ignored), ignored);
    return fs::equivalent(a, b, ignored) ||
           (!first.empty() && first == fs::weakly_canonical(fs::absolute(targetOf(b), ignored), ignored));
}

bool isWhole(const std::string& file) {
    return !isStandardStream(file) && !isWrittenDirectly(targetOf(file));
}

void probeOutput(const std::string& file) {
    if (isStandardStream(file)) {
        return;
    }
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
        probeRename(target.string(), file);
    }
}

void writeOutput(const std::string& file, std::string_view bytes) {
    OutputFile output(file);
    output.write(bytes);
    output.finish();
}

}  // namespace quarzel::tool
