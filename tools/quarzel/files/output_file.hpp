// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <string>
#include <string_view>

/// Output files that are whole or not there. A file is written under another name beside its target, flushed
/// to the disk and then renamed, so that a reader never sees a part of it and a failure leaves what was there
/// before. What is not a regular file, a pipe or a device, is written directly, and "-" is standard output.
/// A file that is replaced keeps its permissions, and a link stays a link.
namespace quarzel::tool {

/// Find out before long work whether an output could be written and put in its place; nothing is left behind.
/// @throws ToolError when not
void probeOutput(const std::string& file);

/// Whether two names stand for one file, be it there yet or not.
bool isSameFile(const std::string& a, const std::string& b);

/// Whether an output is a file that is whole or not there: no pipe, device or standard output.
bool isWhole(const std::string& file);

/// An output that is written piece by piece. Without `finish` it is not there.
class OutputFile {
  public:
    /// @throws ToolError when it cannot be written
    explicit OutputFile(const std::string& file);
    ~OutputFile();

    /// @throws ToolError when that fails
    void write(std::string_view bytes);

    /// Put what was written in its place, at the end.
    /// @throws ToolError when that fails
    void finish();

  private:
    class Target;
    std::unique_ptr<Target> itsTarget;
};

/// Write an output.
/// @throws ToolError when that fails
void writeOutput(const std::string& file, std::string_view bytes);

}  // namespace quarzel::tool
