// SPDX-License-Identifier: MIT
#include "vectors/output_directory.hpp"

#include <fcntl.h>
#include <fmt/format.h>
#include <stdio.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>
#include <set>

#include "files/open_file.hpp"
#include "sweep/sha256.hpp"

namespace fs = std::filesystem;

namespace quarzel::tool {

namespace {

/// Throw unless the directory holds a vector set and no other file.
void requireNothingElse(const std::string& name) {
    std::set<std::string> known = {manifestName};
    try {
        for (const VectorFile& file : readManifest(name).files) {
            known.insert(file.name);
        }
    } catch (const ToolError&) {
        throw fileError(name, "is not empty and no vector set", "give another name");
    }
    for (const auto& entry : fs::recursive_directory_iterator(name)) {
        const std::string file = entry.path().lexically_relative(name).string();
        if (!entry.is_directory() && known.count(file) == 0) {
            throw fileError(entry.path().string(), "is not part of the vector set that would be replaced",
                            "move it away");
        }
    }
}

/// Throw unless the directory may be made or replaced.
void checkPlace(const std::string& name, bool isReplaced) {
    std::error_code ignored;
    if (name.empty()) {
        throw ToolError(ExitCode::usage, "DIRECTORY", "the name is empty", "give one");
    }
    if (!fs::exists(name, ignored)) {
        return;
    }
    if (!fs::is_directory(name, ignored)) {
        throw fileError(name, "is a file", "give the name of a directory that is to be made");
    }
    if (fs::is_empty(name, ignored)) {
        return;
    }
    if (!isReplaced) {
        throw fileError(name, "is not empty", "give another name, or --replace for an older vector set");
    }
    requireNothingElse(name);
}

/// Make a directory and those above it.
void makeDirectories(const fs::path& directory, const std::string& shown) {
    std::error_code error;
    fs::create_directories(directory, error);
    if (error) {
        errno = error.value();
        throw writeError(shown);
    }
}

}  // namespace

OutputDirectory::OutputDirectory(const std::string& name, bool isReplaced) : itsName(name) {
    checkPlace(name, isReplaced);
    std::error_code ignored;
    fs::path target = fs::weakly_canonical(name, ignored);
    if (!target.has_filename()) {
        target = target.parent_path();
    }
    itsTarget = target.string();
    const fs::path temporary = target.parent_path() / fmt::format(".quarzel-{}.tmp.d", ::getpid());
    std::error_code error;
    fs::create_directory(temporary, error);
    if (error) {
        errno = error.value();
        throw writeError(name);
    }
    itsTemporaryName = temporary.string();
}

OutputDirectory::~OutputDirectory() {
    if (!itsTemporaryName.empty()) {
        std::error_code ignored;
        fs::remove_all(itsTemporaryName, ignored);
    }
}

VectorFile OutputDirectory::write(const std::string& file, std::string_view bytes) {
    const fs::path path = fs::path(itsTemporaryName) / file;
    const std::string shown = (fs::path(itsName) / file).string();
    makeDirectories(path.parent_path(), shown);
    OpenFile output(path.string(), O_CREAT | O_EXCL, shown);
    output.write(bytes);
    output.close();
    return {file, bytes.size(), sweep::sha256(bytes)};
}

void OutputDirectory::finish() {
    // One wait for the disk instead of one for each of what may be thousands of files.
    const int directory = ::open(itsTemporaryName.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    const bool isSynced = directory >= 0 && ::syncfs(directory) == 0;
    const int cause = errno;
    if (directory >= 0) {
        ::close(directory);
    }
    if (!isSynced) {
        errno = cause;
        throw writeError(itsName);
    }
    // An empty directory gives way by itself; an older set changes places and goes then.
    if (::rename(itsTemporaryName.c_str(), itsTarget.c_str()) == 0) {
        itsTemporaryName.clear();
        return;
    }
    if (errno != ENOTEMPTY && errno != EEXIST) {
        throw writeError(itsName);
    }
    if (::renameat2(AT_FDCWD, itsTemporaryName.c_str(), AT_FDCWD, itsTarget.c_str(), RENAME_EXCHANGE) != 0) {
        throw writeError(itsName);
    }
}

}  // namespace quarzel::tool
