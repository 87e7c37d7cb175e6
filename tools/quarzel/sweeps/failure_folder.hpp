// SPDX-License-Identifier: MIT
#pragma once

#include <string>

#include "sweep/result.hpp"
#include "sweeps/failing_blocks.hpp"

namespace quarzel::tool {

/// The folder of captures beside the result of a sweep that holds blocks which failed: for each size and core
/// NAME.soft.npy and NAME.sent.npy, and failures.csv, which tells of each block in them where it comes from.
/// That one is removed first and written last, so that where it is, the folder is whole.
class FailureFolder {
  public:
    /// @param result  the file of the result
    explicit FailureFolder(const std::string& result) : itsName(result + ".failures") {}

    const std::string& name() const { return itsName; }

    /// Find out before long work whether it could be written.
    /// @throws ToolError when not
    void probe() const;

    /// Make the blocks again and write them.
    /// @throws ToolError when that fails
    void write(const sweep::Result& result, const FailingBlocks& failing) const;

  private:
    std::string path(const std::string& file) const { return itsName + '/' + file; }

    std::string itsName;
};

}  // namespace quarzel::tool
