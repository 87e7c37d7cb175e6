// SPDX-License-Identifier: MIT
#include "fixed/text_output.hpp"

#include <iostream>
#include <string>

namespace quarzel {

void writeText(std::ostream& stream, std::string_view text) noexcept {
    std::streambuf* buffer = stream.rdbuf();
    if (buffer == nullptr) {
        return;
    }
    try {
        buffer->sputn(text.data(), static_cast<std::streamsize>(text.size()));
        buffer->pubsync();
    } catch (...) {
        // A buffer of the program's own may throw. A message must not end a decode, so it is lost.
        return;
    }
}

namespace {

void writeLine(std::ostream& stream, std::string_view text) {
    std::string line;
    line.reserve(text.size() + 1);
    line.append(text).push_back('\n');
    writeText(stream, line);
}

}  // namespace

void errorLine(std::string_view text) {
    writeLine(std::cerr, text);
}

void outputLine(std::string_view text) {
    writeLine(std::cout, text);
}

}  // namespace quarzel
