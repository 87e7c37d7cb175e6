// SPDX-License-Identifier: MIT
#include "message_sink.hpp"

#include <algorithm>
#include <iostream>
#include <string_view>

#include "fixed/text_output.hpp"

namespace quarzel {

namespace {

thread_local bindings::Messages* messagesOfThread = nullptr;

/// A message without its kind and component: "WARNING:decoder:Text" becomes "Text".
std::string_view plainText(std::string_view line) {
    for (int part = 0; part < 2; ++part) {
        line.remove_prefix(std::min(line.find(':') + 1, line.size()));
    }
    return line;
}

/// Keep a line, or write it to the stream when nobody listens.
void keepOrWrite(std::vector<std::string> bindings::Messages::*kind, std::ostream& stream,
                 std::string_view text) {
    if (messagesOfThread == nullptr) {
        stream.write(text.data(), static_cast<std::streamsize>(text.size())) << std::endl;
        return;
    }
    (messagesOfThread->*kind).emplace_back(plainText(text));
}

}  // namespace

void writeText(std::ostream& stream, std::string_view text) noexcept {
    try {
        if (messagesOfThread != nullptr) {
            messagesOfThread->trace += text;
        } else {
            stream.write(text.data(), static_cast<std::streamsize>(text.size())).flush();
        }
    } catch (...) {
        // A text that is not whole must not pass for one that is: the call that asked for it fails.
        if (messagesOfThread != nullptr) {
            messagesOfThread->incomplete = true;
        }
    }
}

void errorLine(std::string_view text) {
    keepOrWrite(&bindings::Messages::errors, std::cerr, text);
}

void outputLine(std::string_view text) {
    keepOrWrite(&bindings::Messages::warnings, std::cout, text);
}

namespace bindings {

MessageSink::MessageSink(Messages& messages) noexcept : itsOuter(messagesOfThread) {
    messagesOfThread = &messages;
}

MessageSink::~MessageSink() {
    messagesOfThread = itsOuter;
}

}  // namespace bindings

}  // namespace quarzel
