// SPDX-License-Identifier: MIT
#include "captures/npy_header.hpp"

#include <fmt/format.h>

#include <charconv>
#include <optional>
#include <string_view>

#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

constexpr std::string_view magic = "\x93NUMPY";
constexpr std::size_t longestHeader = 65535;  // what format version 1 can hold
constexpr const char* saveAgain = "save the array again with numpy.save";

/// Read `size` bytes.
std::string readBytes(std::istream& stream, std::size_t size, const std::string& file) {
    std::string bytes(size, '\0');
    if (!stream.read(bytes.data(), static_cast<std::streamsize>(size))) {
        throw fileError(file, "ends within its npy header", saveAgain);
    }
    return bytes;
}

/// An unsigned little-endian number.
std::size_t littleEndian(std::string_view bytes) {
    std::size_t value = 0;
    for (std::size_t i = bytes.size(); i > 0; --i) {
        value = value << 8 | static_cast<unsigned char>(bytes[i - 1]);
    }
    return value;
}

/// Takes a header's text apart: a Python dictionary of a string or a list of fields, a truth value and a
/// tuple of integers. The functions that return bool tell whether the text goes on as asked for, and step
/// over it if it does.
class HeaderScanner {
  public:
    explicit HeaderScanner(std::string_view text) : itsRest(text) {}

    /// The whole dictionary, or nothing when it is not well-formed.
    std::optional<NpyHeader> dictionary() {
        std::optional<std::string> type;
        std::optional<bool> fortranOrder;
        std::optional<std::vector<std::uint64_t>> shape;
        std::vector<NpyField> fields;
        if (!skip("{")) {
            return {};
        }
        while (!skip("}")) {
            bool understood = false;
            if (skip("'descr'") && skip(":")) {
                type = next("[") ? "record" : quoted();
                understood = type && (*type != "record" || takeFields(fields));
            } else if (skip("'fortran_order'") && skip(":")) {
                understood = (fortranOrder = truth()).has_value();
            } else if (skip("'shape'") && skip(":")) {
                understood = (shape = tuple()).has_value();
            }
            if (!understood || !(skip(",") || next("}"))) {
                return {};
            }
        }
        skipSpace();
        if (!itsRest.empty() || !type || !fortranOrder || !shape) {
            return {};
        }
        return NpyHeader{*type, *fortranOrder, *shape, fields};
    }

  private:
    void skipSpace() { itsRest.remove_prefix(std::min(itsRest.find_first_not_of(" \n"), itsRest.size())); }

    bool next(std::string_view token) {
        skipSpace();
        return itsRest.starts_with(token);
    }

    bool skip(std::string_view token) {
        const bool found = next(token);
        if (found) {
            itsRest.remove_prefix(token.size());
        }
        return found;
    }

    std::optional<std::string> quoted() {
        if (!skip("'")) {
            return {};
        }
        const std::string_view text = itsRest.substr(0, itsRest.find('\''));
        itsRest.remove_prefix(text.size());
        return skip("'") ? std::optional(std::string(text)) : std::nullopt;
    }

    /// The fields of a structured array: a list of tuples of name, type and maybe shape.
    bool takeFields(std::vector<NpyField>& fields) {
        if (!skip("[")) {
            return false;
        }
        while (!skip("]")) {
            const bool isOpen = skip("(");
            const std::optional<std::string> name = isOpen ? quoted() : std::nullopt;
            const std::optional<std::string> type = name && skip(",") ? quoted() : std::nullopt;
            auto shape = std::optional(std::vector<std::uint64_t>());
            if (type && skip(",")) {
                shape = tuple();
            }
            if (!type || !shape || !skip(")") || !(skip(",") || next("]"))) {
                return false;
            }
            fields.push_back({*name, *type, *shape});
        }
        return true;
    }

    std::optional<bool> truth() {
        if (skip("True")) {
            return true;
        }
        return skip("False") ? std::optional(false) : std::nullopt;
    }

    std::optional<std::vector<std::uint64_t>> tuple() {
        std::vector<std::uint64_t> numbers;
        if (!skip("(")) {
            return {};
        }
        while (!skip(")")) {
            skipSpace();
            std::uint64_t number = 0;
            const char* const end = itsRest.data() + itsRest.size();
            const auto [stop, error] = std::from_chars(itsRest.data(), end, number);
            if (error != std::errc()) {
                return {};
            }
            itsRest.remove_prefix(static_cast<std::size_t>(stop - itsRest.data()));
            numbers.push_back(number);
            if (!skip(",") && !next(")")) {
                return {};
            }
        }
        return numbers;
    }

    std::string_view itsRest;
};

}  // namespace

bool isNpy(std::istream& stream, const std::string& file) {
    return file.ends_with(".npy") || stream.peek() == std::char_traits<char>::to_int_type(magic.front());
}

NpyHeader readNpyHeader(std::istream& stream, const std::string& file) {
    const std::string start = readBytes(stream, magic.size() + 2, file);
    if (!start.starts_with(magic)) {
        throw fileError(file, "is not an npy file", saveAgain);
    }
    const char version = start[magic.size()];
    if (version < 1 || version > 3) {
        throw fileError(file, fmt::format("has npy format version {}, which is unknown", int{version}),
                        saveAgain);
    }
    const std::size_t size = littleEndian(readBytes(stream, version == 1 ? 2 : 4, file));
    if (size > longestHeader) {
        throw fileError(file, fmt::format("has an npy header of {} bytes", size), saveAgain);
    }
    const std::string text = readBytes(stream, size, file);
    const std::optional<NpyHeader> header = HeaderScanner(text).dictionary();
    if (!header) {
        throw fileError(file, "has an npy header that cannot be understood", saveAgain);
    }
    return *header;
}

void requireCOrder(const NpyHeader& header, const std::string& file) {
    if (header.fortranOrder) {
        throw fileError(file, "is stored in Fortran order", "save numpy.ascontiguousarray of the array");
    }
}

std::string shapeText(const std::vector<std::uint64_t>& shape) {
    return fmt::format("({}{})", fmt::join(shape, ", "), shape.size() == 1 ? "," : "");
}

void requireEnd(std::istream& stream, const std::string& file) {
    if (stream.peek() != std::istream::traits_type::eof()) {
        throw fileError(file, "goes on after the end of its array", "save one array a file");
    }
}

}  // namespace quarzel::tool
