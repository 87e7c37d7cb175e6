// SPDX-License-Identifier: MIT
#pragma once

#include <sys/types.h>

#include <string>
#include <string_view>

#include "tool_error.hpp"

namespace quarzel::tool {

/// The error for the system call on an output that has just failed.
ToolError writeError(const std::string& file);

/// The permissions of a new file, or directory, that the user's umask leaves of these. One thread at a time.
mode_t permissionsOfNew(mode_t wanted);

/// Find out whether something could be renamed to this name, of a file or a directory. Nothing is altered.
/// @param shown  for error messages
/// @throws ToolError when not
void probeRename(const std::string& target, const std::string& shown);

/// Wait until the names in a directory are on the disk as they are.
/// @param shown  for error messages
/// @throws ToolError when that fails
void syncDirectory(const std::string& directory, const std::string& shown);

/// A file open for writing. What fails throws a ToolError.
class OpenFile {
  public:
    /// @param name   the file that is opened
    /// @param flags  of open(2) beyond those for writing
    /// @param shown  its name for error messages
    OpenFile(const std::string& name, int flags, std::string shown);

    /// @param descriptor  open for writing, closed with this; below 0: the call that was to open it has
    /// failed
    OpenFile(int descriptor, std::string shown);
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;
    ~OpenFile();

    void write(std::string_view bytes);

    /// Nothing happens where the file system has none.
    /// @param permissions  as in chmod(2)
    void setPermissions(mode_t permissions);

    /// Wait until what was written is on the disk.
    void sync();

    /// Some file systems report a full disk only here.
    void close();

  private:
    int itsDescriptor;
    std::string itsShown;
};

}  // namespace quarzel::tool
