// SPDX-License-Identifier: MIT
#include "files/output_file.hpp"

#include <fcntl.h>
#include <fmt/format.h>
#include <unistd.h>

#include <array>
#include <filesystem>

#include "files/open_file.hpp"
#include "tool_error.hpp"

namespace fs = std::filesystem;

namespace quarzel::tool {

namespace {

/// The file that a name stands for: links are followed, so that they stay links.
fs::path targetOf(const std::string& file) {
    std::error_code error;
    const fs::path target = fs::canonical(file, error);
    return error ? fs::path(file) : target;
}

/// A name that no other process uses, not even one on another machine that sees the same directory.
std::string temporaryName() {
    std::array<char, 256> host{};
    ::gethostname(host.data(), host.size() - 1);
    return fmt::format(".quarzel-{}-{}.tmp", host.data(), ::getpid());
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
          itsTemporaryName(isWrittenDirectly(itsTarget) ? fs::path()
                                                        : itsTarget.parent_path() / temporaryName()),
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
    // Absolute first: of a relative name that is not there yet nothing would be canonical.
    const fs::path first = fs::weakly_canonical(fs::absolute(a, ignored), ignored);
    return fs::equivalent(a, b, ignored) ||
           (!first.empty() && first == fs::weakly_canonical(fs::absolute(b, ignored), ignored));
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
