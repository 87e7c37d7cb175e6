// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <istream>
#include <string>
#include <string_view>

namespace quarzel::tool {

/// The lines of a text, one at a time, in memory that does not grow with them.
class TraceLines {
  public:
    /// @param name  the file, for error messages
    TraceLines(std::istream& stream, std::string name);
    TraceLines(const TraceLines&) = delete;
    TraceLines& operator=(const TraceLines&) = delete;

    /// Go on to the next line.
    /// @throws ToolError when the stream fails
    void advance();

    /// Whether there is no further line.
    bool ended() const { return itsState == State::ended; }

    /// The line, without its line end and blanks before that. Nothing when it is not whole, so that no reader
    /// takes it for what it expects: when it has no line end, is longer than any line of a trace or is none.
    std::string_view text() const { return isWhole() ? itsText : std::string_view(); }

    bool isWhole() const { return itsState == State::whole; }

    const std::string& name() const { return itsName; }

    /// Its number, from 1.
    std::size_t number() const { return itsNumber; }

    /// Throw a ToolError that tells that the line is not what was expected.
    [[noreturn]] void fail(std::string_view expected) const;

    /// Throw a ToolError.
    /// @param place  where in the line the fault is, ", " at its front
    /// @param found  what is there
    [[noreturn]] void fail(std::string_view place, std::string_view found, std::string_view expected) const;

  private:
    enum class State { whole, withoutEnd, tooLong, ended };

    std::istream& itsStream;
    std::string itsName;
    std::array<char, 65536> itsBuffer{};  ///< the longest line, soft values of 6147 steps, takes two thirds
    std::string_view itsText;
    std::size_t itsNumber = 0;
    State itsState = State::whole;
};

}  // namespace quarzel::tool
