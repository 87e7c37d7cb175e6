// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include <limits>
#include <string_view>

#include "tool_error.hpp"
#include "vectors/memory_image.hpp"

namespace quarzel::tool {

namespace {

constexpr std::string_view digits = "0123456789abcdef";
constexpr int endOfText = std::char_traits<char>::eof();

/// Walks over the text of a memory.
class MemoryScanner {
  public:
    MemoryScanner(std::istream& stream, std::size_t size, const std::string& file)
        : itsText(*stream.rdbuf()), itsFile(file) {
        itsImage.words.resize(size);
    }

    MemoryImage image() {
        for (int c = next(); c != endOfText; c = next()) {
            if (c == '/') {
                skipComment();
            } else if (c == '@') {
                readAddress();
            } else if (!isSpace(c)) {
                readWord(c);
            }
        }
        return std::move(itsImage);
    }

  private:
    static bool isSpace(int c) { return c == ' ' || (c >= '\t' && c <= '\r'); }

    int next() {
        itsLine += itsWasNewline ? 1 : 0;
        const int c = itsText.sbumpc();
        itsWasNewline = c == '\n';
        return c;
    }

    /// Whether the word or address that is being read goes on.
    bool goesOn() {
        const int c = itsText.sgetc();
        return c != endOfText && c != '/' && c != '@' && !isSpace(c);
    }

    void skipComment() {
        const int kind = next();
        if (kind != '/' && kind != '*') {
            refuse("a '/' that begins no comment");
        }
        for (int before = 0, c = next();; before = c, c = next()) {
            if (kind == '/' ? c == '\n' || c == endOfText : before == '*' && c == '/') {
                return;
            }
            if (c == endOfText) {
                refuse("a comment that does not end");
            }
        }
    }

    void readAddress() {
        std::uint64_t address = 0;
        bool hasDigits = false;
        while (goesOn()) {
            const int c = next();
            if (c == '_') {
                continue;
            }
            const std::size_t digit = digits.find(static_cast<char>(c | 0x20));
            if (digit == std::string_view::npos || address >> 60 != 0) {
                refuse("an address that is not a hexadecimal number");
            }
            address = address << 4 | digit;
            hasDigits = true;
        }
        if (!hasDigits) {
            refuse("an '@' without an address");
        }
        itsAddress = address;
    }

    void readWord(int first) {
        MemoryWord word{MemoryWord::Kind::known, 0, itsLine};
        std::uint64_t value = 0;
        for (int c = first;; c = next()) {
            addDigit(word.kind, value, static_cast<char>(c));
            if (!goesOn()) {
                break;
            }
        }
        word.value = static_cast<std::uint32_t>(value);
        if (itsAddress < itsImage.words.size()) {
            itsImage.words[itsAddress] = word;
        } else {
            ++itsImage.beyond;
        }
        ++itsAddress;
    }

    void addDigit(MemoryWord::Kind& kind, std::uint64_t& value, char c) {
        if (c == '_') {
            return;
        }
        const auto lower = static_cast<char>(c | 0x20);
        const std::size_t digit = digits.find(lower);
        if (lower == 'x') {
            kind = MemoryWord::Kind::x;
        } else if (lower == 'z' || c == '?') {
            kind = kind == MemoryWord::Kind::x ? kind : MemoryWord::Kind::z;
        } else if (digit == std::string_view::npos) {
            refuse(fmt::format("'{}', which is not a hexadecimal digit", c));
        }
        value = value << 4 | (digit == std::string_view::npos ? 0 : digit);
        if (value > std::numeric_limits<std::uint32_t>::max()) {
            refuse("a word of more than 32 bits");
        }
    }

    [[noreturn]] void refuse(const std::string& what) const {
        throw fileError(fmt::format("{}: line {}", itsFile, itsLine), "holds " + what,
                        "write the memory with $writememh, a decision a word");
    }

    std::streambuf& itsText;
    std::string itsFile;
    MemoryImage itsImage;
    std::uint64_t itsAddress = 0;
    std::size_t itsLine = 1;
    bool itsWasNewline = false;
};

}  // namespace

MemoryImage readMemoryText(std::istream& stream, std::size_t size, const std::string& file) {
    return MemoryScanner(stream, size, file).image();
}

}  // namespace quarzel::tool
