// SPDX-License-Identifier: MIT
#define CSV_IO_NO_THREAD  // reading is a small part of the work; a thread for it would buy nothing
#include <libfccp/csv.h>

#include <fmt/format.h>

#include <array>
#include <charconv>
#include <cstring>
#include <memory>

#include "captures/capture_readers.hpp"
#include "options/block_sizes.hpp"
#include "options/quantiser_options.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// The bytes of a stream and one more line end: the CSV reader may run on into old data when the last line of
/// a long file has none. Refuses zero bytes, which would hide the rest of their line.
class TextSource : public io::ByteSourceBase {
  public:
    TextSource(std::istream& stream, const std::string& file) : itsStream(stream), itsFile(file) {}

    int read(char* buffer, int size) override {
        itsStream.read(buffer, size);
        auto count = static_cast<int>(itsStream.gcount());
        if (std::memchr(buffer, '\0', static_cast<std::size_t>(count)) != nullptr) {
            throw fileError(itsFile, "is neither an npy file nor text",
                            "give a capture in one of these formats");
        }
        if (count < size && !itsEnded) {
            buffer[count++] = '\n';
            itsEnded = true;
        }
        return count;
    }

  private:
    std::istream& itsStream;
    std::string itsFile;
    bool itsEnded = false;
};

/// Every field is taken as text, since the reader would take an empty one for 0. Empty lines are stepped over
/// but counted, and so a gap between line numbers is the end of a block.
using Reader = io::CSVReader<3, io::trim_chars<' ', '\t'>, io::no_quote_escape<','>, io::throw_on_overflow,
                             io::empty_line_comment>;

constexpr std::array<const char*, 3> columns = {"systematic", "parity1", "parity2"};

/// A field as a number of the type Number; nothing when it is no such number.
template <class Number>
std::optional<Number> toNumber(const char* field) {
    Number value = 0;
    const char* const end = field + std::strlen(field);
    const auto [stop, error] = std::from_chars(field, end, value);
    return error == std::errc() && stop == end && value == value ? std::optional(value) : std::nullopt;
}

/// The soft value of a field; nothing when it holds none.
/// @param scale  there when fields are real numbers
std::optional<std::int32_t> softOf(const char* field, std::optional<double> scale) {
    if (!scale) {
        return toNumber<std::int32_t>(field);
    }
    const std::optional<double> value = toNumber<double>(field);
    if (!value) {
        return std::nullopt;
    }
    std::int8_t soft = 0;
    quantise(std::span(&*value, 1), std::span(&soft, 1), *scale);
    return soft;
}

/// What to do about a field that holds no soft value.
std::string remedyOf(std::optional<double> scale) {
    return scale ? "give a real number, 0 for a bit that is unknown"
                 : "give a whole number of at most 32 bits, in units of 1/8; for real numbers " +
                       realNumbersRemedy();
}

/// A block while its lines come in.
struct OpenBlock {
    std::array<std::vector<std::int32_t>, 3> streams;
    unsigned firstLine = 0;

    /// Append the block to the capture and start anew. An empty block is none.
    void close(Capture& capture, const std::string& file) {
        const std::size_t positions = streams[0].size();
        if (positions == 0) {
            return;
        }
        const std::uint32_t K = blockSizeOf(positions, fmt::format("{}: line {}", file, firstLine));
        if (capture.soft.empty()) {
            capture.blockSize = K;
        } else if (K != capture.blockSize) {
            throw fileError(
                file,
                fmt::format("line {}: block {}, counted from 0, has {} positions, the blocks before have {}",
                            firstLine, capture.blocks(), positions, capture.positions()),
                "give blocks of one size a file");
        }
        for (std::vector<std::int32_t>& stream : streams) {
            capture.soft.insert(capture.soft.end(), stream.begin(), stream.end());
            stream.clear();
        }
    }
};

Capture readBlocks(Reader& reader, const std::string& file, std::optional<double> scale) {
    Capture capture;
    OpenBlock block;
    unsigned lastLine = 0;
    std::array<const char*, 3> fields{};
    while (reader.read_row(fields[0], fields[1], fields[2])) {
        const unsigned line = reader.get_file_line();
        if (line != lastLine + 1) {
            block.close(capture, file);
            block.firstLine = line;
        }
        lastLine = line;
        for (std::size_t column = 0; column < 3; ++column) {
            const std::optional<std::int32_t> soft = softOf(fields[column], scale);
            if (!soft) {
                throw fileError(file,
                                fmt::format("line {}: {} is '{:.20}'", line, columns[column], fields[column]),
                                remedyOf(scale));
            }
            block.streams[column].push_back(*soft);
        }
    }
    block.close(capture, file);
    return capture;
}

}  // namespace

Capture readCsvCapture(std::istream& stream, const std::string& file, std::optional<double> scale) {
    constexpr const char* lineRemedy = "give systematic,parity1,parity2 in every line";
    Capture capture;
    try {
        Reader reader(file, std::make_unique<TextSource>(stream, file));
        reader.read_header(io::ignore_no_column, columns[0], columns[1], columns[2]);
        capture = readBlocks(reader, file, scale);
    } catch (const io::error::too_few_columns& error) {
        throw fileError(file, fmt::format("line {}: fewer than 3 values", error.file_line), lineRemedy);
    } catch (const io::error::too_many_columns& error) {
        throw fileError(file, fmt::format("line {}: more than 3 values", error.file_line), lineRemedy);
    } catch (const io::error::line_length_limit_exceeded& error) {
        throw fileError(file, fmt::format("line {}: longer than 16 MiB", error.file_line), lineRemedy);
    } catch (const io::error::base&) {
        throw fileError(file, "has neither an npy header nor the CSV header systematic,parity1,parity2",
                        "give a capture in one of these formats");
    }
    if (capture.soft.empty()) {
        throw fileError(file, "holds no block", "record at least one");
    }
    return capture;
}

}  // namespace quarzel::tool
