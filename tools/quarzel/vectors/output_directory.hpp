// SPDX-License-Identifier: MIT
#pragma once

#include <sys/types.h>

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "vectors/manifest.hpp"

namespace quarzel::tool {

/// A directory that is whole or not there. It is filled under another name beside its place and renamed at
/// the end. Without `finish` nothing is left of it.
class OutputDirectory {
  public:
    /// @param name        of the directory, which is missing or empty
    /// @param isReplaced  an older vector set of that name, and nothing else, may be there too; it goes once
    ///                    the new one is whole, but for files that have appeared in it meanwhile
    /// @throws ToolError when something else is there, or the directory could not be put in its place
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
    void prepare();
    void exchange();

    std::string itsName;                    ///< as the user gave it
    std::string itsTarget;                  ///< the same without a slash at the end, links followed
    std::optional<VectorContent> itsOlder;  ///< the set that is replaced
    ino_t itsOlderInode = 0;                ///< of its directory
    std::string itsTemporaryName;           ///< empty: gone
};

}  // namespace quarzel::tool
