// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <charconv>
#include <concepts>
#include <cstddef>
#include <functional>
#include <initializer_list>
#include <iosfwd>
#include <string_view>

namespace quarzel {

/// A whole number in decimal, for a line that is put together without allocating.
class Decimal {
  public:
    explicit Decimal(std::integral auto value) {
        char* const first = itsDigits.data();
        itsLength =
            static_cast<std::size_t>(std::to_chars(first, first + itsDigits.size(), value).ptr - first);
    }
    Decimal(const Decimal&) = delete;
    Decimal& operator=(const Decimal&) = delete;

    operator std::string_view() const { return {itsDigits.data(), itsLength}; }

  private:
    std::array<char, 24> itsDigits{};
    std::size_t itsLength;
};

/// Where the lines of a model or a component go: to a receiver or, where there is none, to the standard
/// streams, errors to the error stream and all else to the output stream.
///
/// A line is written whole, in one write, and flushed. Neither the formatting flags nor the locale nor the
/// error state of a standard stream change it or are changed. Nothing is thrown. A line of usual length is
/// written without allocating, so that it comes out when there is no memory left.
class Messages {
  public:
    enum class Kind : int { error = 1, warning = 2, trace = 3 };

    /// @param text  the line without its line end, valid during the call
    using Receiver = void (*)(void* cookie, int kind, const char* text);

    /// What a line is made of.
    using Parts = std::initializer_list<std::string_view>;

    /// To the standard streams.
    constexpr Messages() = default;

    /// To a receiver; null means the standard streams.
    constexpr Messages(Receiver receiver, void* cookie) : itsReceiver(receiver), itsCookie(cookie) {}

    /// Write a line of a kind.
    /// @return whether it was taken
    bool error(Parts line) const noexcept { return write(Kind::error, line); }
    bool warning(Parts line) const noexcept { return write(Kind::warning, line); }
    bool trace(Parts line) const noexcept { return write(Kind::trace, line); }

    /// Write a text of several lines, as trace: `writeTo` is called with a stream for it. A failure to write
    /// to the standard output stream sets its badbit and throws nothing.
    void traceText(const std::function<void(std::ostream&)>& writeTo) const;

  private:
    bool write(Kind kind, Parts line) const noexcept;

    Receiver itsReceiver = nullptr;
    void* itsCookie = nullptr;
};

/// For components that nobody has given another place for their lines.
inline constexpr Messages standardStreams;

}  // namespace quarzel
