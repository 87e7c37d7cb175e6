// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>

#include "tool_error.hpp"

namespace quarzel::tool {

/// The error for the system call on an output that has just failed.
ToolError writeError(const std::string& file);

/// A file open for writing. Every function throws a ToolError when it fails.
class OpenFile {
  public:
    /// @param name   the file that is opened
    /// @param flags  of open(2) beyond those for writing
    /// @param shown  its name for error messages
    OpenFile(const std::string& name, int flags, std::string shown);
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;
    ~OpenFile();

    void write(std::string_view bytes);

    /// Wait until what was written is on the disk.
    void sync();

    /// Some file systems report a full disk only here.
    void close();

  private:
    int itsDescriptor;
    std::string itsShown;
};

}  // namespace quarzel::tool
