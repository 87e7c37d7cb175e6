// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "vectors/manifest.hpp"

namespace quarzel::tool {

/// A directory that is whole or not there. It is filled under another name beside its place and renamed at
/// the end. Without `finish` nothing is left of it.
class OutputDirectory {
  public:
    /// @param name       of the directory, which is missing or empty
    /// @param isReplaced  an older vector set of that name, and nothing else, may be there too; it goes once
    /// the
    ///                   new one is whole
    /// @throws ToolError when something else is there, or it cannot be made
    OutputDirectory(const std::string& name, bool isReplaced);
    OutputDirectory(const OutputDirectory&) = delete;
    OutputDirectory& operator=(const OutputDirectory&) = delete;
    ~OutputDirectory();

    /// Write a file; the folders in its name are made.
    /// @return  what the manifest says about it
    /// @throws ToolError when that fails
    VectorFile write(const std::string& file, std::string_view bytes);

    /// Put the directory in its place.
    /// @throws ToolError when that fails
    void finish();

  private:
    std::string itsName;           ///< as the user gave it
    std::string itsTarget;         ///< the same without a slash at the end, links followed
    std::string itsTemporaryName;  ///< empty: gone
};

}  // namespace quarzel::tool
