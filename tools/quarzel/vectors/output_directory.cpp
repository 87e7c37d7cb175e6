// SPDX-License-Identifier: MIT
#include "vectors/output_directory.hpp"

#include <fcntl.h>
#include <fmt/format.h>
#include <stdio.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <set>
#include <vector>

#include "files/open_file.hpp"
#include "sweep/sha256.hpp"

namespace fs = std::filesystem;

namespace quarzel::tool {

namespace {

/// Throw for what a function of std::filesystem has reported.
void requireDone(const std::error_code& error, const std::string& shown) {
    if (error) {
        throw fileError(shown, "cannot be read: " + error.message(), "make it readable");
    }
}

std::set<std::string> namesOf(const VectorContent& set) {
    std::set<std::string> names = {manifestName};
    for (const VectorFile& file : set.files) {
        names.insert(file.name);
    }
    return names;
}

/// The vector set in a directory. Throw unless it holds one and no other file.
VectorContent onlySetIn(const std::string& name) {
    VectorContent set;
    try {
        set = readManifest(name);
    } catch (const ToolError&) {
        throw fileError(name, "is not empty and no vector set", "give another name");
    }
    const std::set<std::string> known = namesOf(set);
    std::error_code error;
    for (fs::recursive_directory_iterator entry(name, error), end; !error && entry != end;
         entry.increment(error)) {
        const std::string file = entry->path().lexically_relative(name).string();
        const bool isDirectory = entry->symlink_status(error).type() == fs::file_type::directory;
        if (!error && !isDirectory && known.count(file) == 0) {
            throw fileError(entry->path().string(), "is not part of the vector set that would be replaced",
                            "move it away");
        }
    }
    requireDone(error, name);
    return set;
}

/// Throw unless the directory may be made or replaced.
/// @return the set that is replaced, if there is one
std::optional<VectorContent> checkPlace(const std::string& name, bool isReplaced) {
    if (name.empty()) {
        throw ToolError(ExitCode::usage, "DIRECTORY", "the name is empty", "give one");
    }
    std::error_code error;
    const fs::file_status status = fs::status(name, error);
    if (status.type() == fs::file_type::not_found) {
        return {};
    }
    requireDone(error, name);
    if (!fs::is_directory(status)) {
        throw fileError(name, "is a file", "give the name of a directory that is to be made");
    }
    const bool isEmpty = fs::is_empty(name, error);
    requireDone(error, name);
    if (isEmpty) {
        return {};
    }
    if (!isReplaced) {
        throw fileError(name, "is not empty", "give another name, or --replace for an older vector set");
    }
    return onlySetIn(name);
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

/// The number of a directory in its file system; 0: it is not there.
ino_t inodeOf(const std::string& directory) {
    struct stat status {};
    return ::stat(directory.c_str(), &status) == 0 ? status.st_ino : 0;
}

bool exchangeNames(const std::string& a, const std::string& b) {
    return ::renameat2(AT_FDCWD, a.c_str(), AT_FDCWD, b.c_str(), RENAME_EXCHANGE) == 0;
}

/// Throw unless directories on this file system can change places.
/// @param directory  an empty one
void probeExchange(const std::string& directory, const std::string& shown) {
    const std::string a = directory + "/a";
    const std::string b = directory + "/b";
    const bool isPossible =
        ::mkdir(a.c_str(), 0700) == 0 && ::mkdir(b.c_str(), 0700) == 0 && exchangeNames(a, b);
    ::rmdir(a.c_str());
    ::rmdir(b.c_str());
    if (!isPossible) {
        throw fileError(shown, "is on a file system where directories cannot change places",
                        "remove the older set, or give another name");
    }
}

/// Remove the files of a set and all directories that are then empty.
void removeSet(const std::string& directory, const VectorContent& set) {
    const std::set<std::string> known = namesOf(set);
    std::vector<fs::path> paths;
    std::error_code ignored;
    for (fs::recursive_directory_iterator entry(directory, ignored), end; !ignored && entry != end;
         entry.increment(ignored)) {
        const bool isDirectory = entry->symlink_status(ignored).type() == fs::file_type::directory;
        if (isDirectory || known.count(entry->path().lexically_relative(directory).string()) != 0) {
            paths.push_back(entry->path());
        }
    }
    // What is in a directory comes after it. One that is not empty stays.
    std::for_each(paths.rbegin(), paths.rend(),
                  [&ignored](const fs::path& path) { fs::remove(path, ignored); });
    fs::remove(directory, ignored);
}

}  // namespace

OutputDirectory::OutputDirectory(const std::string& name, bool isReplaced)
    : itsName(name), itsOlder(checkPlace(name, isReplaced)) {
    std::error_code ignored;
    fs::path target = fs::weakly_canonical(fs::absolute(name, ignored), ignored);
    if (!target.has_filename()) {
        target = target.parent_path();
    }
    itsTarget = target.string();
    std::string temporary = (target.parent_path() / ".quarzel-XXXXXX").string();
    if (::mkdtemp(temporary.data()) == nullptr) {
        throw writeError(name);
    }
    itsTemporaryName = temporary;
    try {
        prepare();
    } catch (const ToolError&) {
        ::rmdir(itsTemporaryName.c_str());
        throw;
    }
}

OutputDirectory::~OutputDirectory() {
    if (!itsTemporaryName.empty()) {
        std::error_code ignored;
        fs::remove_all(itsTemporaryName, ignored);
    }
}

/// Give the empty directory its permissions, and find out before the work whether it can be put in its place.
void OutputDirectory::prepare() {
    probeRename(itsTarget, itsName);
    struct stat status {};
    constexpr mode_t all = 07777;
    const bool isThere = ::stat(itsTarget.c_str(), &status) == 0;
    if (::chmod(itsTemporaryName.c_str(), isThere ? status.st_mode & all : permissionsOfNew(0777)) != 0) {
        throw writeError(itsName);
    }
    if (itsOlder) {
        itsOlderInode = status.st_ino;
        probeExchange(itsTemporaryName, itsName);
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
    if (itsOlder) {
        exchange();
    } else if (::rename(itsTemporaryName.c_str(), itsTarget.c_str()) != 0) {
        // A directory that is still empty has given way. One that is not belongs to somebody else.
        throw writeError(itsName);
    }
    itsTemporaryName.clear();
    syncDirectory(fs::path(itsTarget).parent_path().string(), itsName);
}

/// Let the new set and the older one change places, and remove the older one.
void OutputDirectory::exchange() {
    if (!exchangeNames(itsTemporaryName, itsTarget)) {
        throw writeError(itsName);
    }
    if (inodeOf(itsTemporaryName) != itsOlderInode) {
        exchangeNames(itsTemporaryName, itsTarget);
        throw fileError(itsName, "was replaced by another process meanwhile", "run the command again");
    }
    removeSet(itsTemporaryName, *itsOlder);
    if (inodeOf(itsTemporaryName) != 0) {
        std::cerr << fmt::format(
            "quarzel: warning: {}: files that are not part of the older set are kept in {}\n", itsName,
            itsTemporaryName);
    }
}

}  // namespace quarzel::tool
