// SPDX-License-Identifier: MIT
#pragma once

#include <iosfwd>
#include <string_view>

namespace quarzel {

/// Write a text to a stream as it stands, in one write, and flush it. Neither reads nor changes the stream's
/// formatting flags, locale or error state: the text goes straight to the stream's buffer, so that nothing
/// the program has set on its streams changes what the model says. Never throws.
void writeText(std::ostream& stream, std::string_view text) noexcept;

/// One line of an error: `text` without its line end, to the standard error stream.
void errorLine(std::string_view text);

/// One line of a warning or trace: `text` without its line end, to the standard output stream.
void outputLine(std::string_view text);

}  // namespace quarzel
