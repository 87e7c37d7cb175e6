// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <optional>
#include <string>

namespace quarzel::tool {

/// Keeps other processes from working on a file at the same time, on this machine and, where the file system
/// has locks for that, on others. While it lives, the file NAME.lock tells who holds it; a process that is
/// killed holds nothing. Where the file system has no locks, it keeps nobody.
class FileLock {
  public:
    /// @param file  which need not exist
    /// @throws ToolError when another process holds it, or NAME.lock cannot be made
    explicit FileLock(const std::string& file);
    FileLock(const FileLock&) = delete;
    FileLock& operator=(const FileLock&) = delete;
    ~FileLock();

  private:
    std::string itsName;
    int itsDescriptor;
};

/// Keep other commands that extend an output from it.
/// @return the lock; null where there is no output, or none that is a file
/// @throws ToolError when another process holds it
std::unique_ptr<FileLock> lockOutput(const std::optional<std::string>& output);

}  // namespace quarzel::tool
