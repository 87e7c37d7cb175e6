// SPDX-License-Identifier: MIT
#include "fixed/messages.hpp"

#include <algorithm>
#include <iostream>
#include <memory>
#include <new>
#include <streambuf>
#include <string>

namespace quarzel {

namespace {

/// A line and its end, in memory of its own unless it is unusually long. When there is no memory for a long
/// one, what fits is left of it.
class Line {
  public:
    explicit Line(Messages::Parts parts) noexcept {
        std::size_t length = 0;
        for (const std::string_view part : parts) {
            length += part.size();
        }
        std::size_t room = itsFew.size();
        if (length + lineEnd > room) {
            itsMany.reset(new (std::nothrow) char[length + lineEnd]);
            if (itsMany != nullptr) {
                itsText = itsMany.get();
                room = length + lineEnd;
            }
        }
        for (const std::string_view part : parts) {
            itsLength += part.copy(itsText + itsLength, room - lineEnd - itsLength);
        }
    }
    Line(const Line&) = delete;
    Line& operator=(const Line&) = delete;

    /// Without its end, closed by a zero.
    const char* text() noexcept {
        itsText[itsLength] = '\0';
        return itsText;
    }

    std::string_view withEnd() noexcept {
        itsText[itsLength] = '\n';
        return {itsText, itsLength + lineEnd};
    }

  private:
    static constexpr std::size_t lineEnd = 1;

    std::array<char, 512> itsFew;
    std::unique_ptr<char[]> itsMany;
    char* itsText = itsFew.data();
    std::size_t itsLength = 0;
};

/// Straight to the stream's buffer, so that nothing the program has set on its stream changes the text.
bool writeText(std::ostream& stream, std::string_view text) noexcept {
    std::streambuf* buffer = stream.rdbuf();
    if (buffer == nullptr) {
        return false;
    }
    try {
        const auto size = static_cast<std::streamsize>(text.size());
        return buffer->sputn(text.data(), size) == size && buffer->pubsync() == 0;
    } catch (...) {
        // A buffer of the program's own may throw.
        return false;
    }
}

/// Hands what is written to it on to a receiver, line by line.
class LineBuffer : public std::streambuf {
  public:
    LineBuffer(Messages::Receiver receiver, void* cookie) : itsReceiver(receiver), itsCookie(cookie) {}

  protected:
    std::streamsize xsputn(const char* text, std::streamsize size) override {
        std::for_each_n(text, size, [this](char c) { take(c); });
        return size;
    }

    int_type overflow(int_type c) override {
        if (!traits_type::eq_int_type(c, traits_type::eof())) {
            take(traits_type::to_char_type(c));
        }
        return traits_type::not_eof(c);
    }

  private:
    void take(char c) {
        if (c != '\n') {
            itsLine += c;
            return;
        }
        itsReceiver(itsCookie, static_cast<int>(Messages::Kind::trace), itsLine.c_str());
        itsLine.clear();
    }

    Messages::Receiver itsReceiver;
    void* itsCookie;
    std::string itsLine;
};

}  // namespace

bool Messages::write(Kind kind, Parts parts) const noexcept {
    Line line(parts);
    if (itsReceiver != nullptr) {
        try {
            itsReceiver(itsCookie, static_cast<int>(kind), line.text());
            return true;
        } catch (...) {
            // A message must not end a call.
            return false;
        }
    }
    if (kind != Kind::error) {
        return writeText(std::cout, line.withEnd());
    }
    // What the program has written before comes first in a log of both streams, as with std::cerr <<.
    if (std::ostream* const tied = std::cerr.tie()) {
        writeText(*tied, "");
    }
    return writeText(std::cerr, line.withEnd());
}

void Messages::traceText(const std::function<void(std::ostream&)>& writeTo) const {
    if (itsReceiver != nullptr) {
        LineBuffer buffer(itsReceiver, itsCookie);
        std::ostream stream(&buffer);
        writeTo(stream);
        if (!stream) {
            // A text that is not whole must not pass for one that is.
            throw std::bad_alloc();
        }
        return;
    }
    // A stream of our own: what the program has set on its own one does not matter.
    std::ostream stream(std::cout.rdbuf());
    writeTo(stream);
    if (!stream.flush()) {
        try {
            std::cout.setstate(std::ios_base::badbit);
        } catch (...) {
            // The mask of exceptions is the program's, but it did not call the stream.
            return;
        }
    }
}

}  // namespace quarzel
