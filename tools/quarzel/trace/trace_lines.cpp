// SPDX-License-Identifier: MIT
#include "trace/trace_lines.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// The start of a text that may be anything, fit to be shown.
std::string excerpt(std::string_view text) {
    constexpr std::size_t longest = 40;
    std::string shown(text.substr(0, longest));
    std::replace_if(
        shown.begin(), shown.end(), [](char c) { return c < ' ' || c > '~'; }, '?');
    return '\'' + shown + (text.size() > longest ? "..." : "") + '\'';
}

}  // namespace

TraceLines::TraceLines(std::istream& stream, std::string name) : itsStream(stream), itsName(std::move(name)) {
    advance();
}

void TraceLines::advance() {
    ++itsNumber;
    itsStream.getline(itsBuffer.data(), static_cast<std::streamsize>(itsBuffer.size()));
    if (itsStream.bad()) {
        throw fileError(itsName, fmt::format("cannot be read beyond line {}", itsNumber - 1),
                        "copy it again");
    }
    const auto count = static_cast<std::size_t>(itsStream.gcount());
    if (itsStream.fail()) {
        itsState = itsStream.eof() ? State::ended : State::tooLong;
        itsText = {itsBuffer.data(), count};
        return;
    }
    itsState = itsStream.eof() ? State::withoutEnd : State::whole;
    itsText = {itsBuffer.data(), itsState == State::whole ? count - 1 : count};
    // All blanks give an end of npos, and npos + 1 is 0.
    itsText = itsText.substr(0, itsText.find_last_not_of(" \t\r") + 1);
}

void TraceLines::fail(std::string_view expected) const {
    switch (itsState) {
        case State::whole:
            fail("", excerpt(itsText), expected);
        case State::withoutEnd:
            fail("", "cut short after " + excerpt(itsText), expected);
        case State::tooLong:
            fail("", fmt::format("longer than {} characters", itsBuffer.size() - 1), expected);
        case State::ended:
            break;
    }
    throw fileError(itsName, itsNumber == 1 ? "is empty" : fmt::format("ends before line {}", itsNumber),
                    fmt::format("expected {}", expected));
}

void TraceLines::fail(std::string_view place, std::string_view found, std::string_view expected) const {
    throw fileError(itsName, fmt::format("line {}{} is {}", itsNumber, place, found),
                    fmt::format("expected {}", expected));
}

}  // namespace quarzel::tool
