// SPDX-License-Identifier: MIT
#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <concepts>
#include <cstdint>
#include <xtensor/xadapt.hpp>
#include <xtensor/xnpy.hpp>

#include "captures/capture_readers.hpp"
#include "captures/npy_header.hpp"
#include "options/block_sizes.hpp"
#include "options/quantiser_options.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// Read blocks of `values` elements of the type Element, in the machine's (little-endian) byte order.
/// @param scale  that of real numbers
template <class Element>
std::vector<std::int32_t> readBlocks(std::istream& stream, std::uint64_t count, std::size_t values,
                                     const std::string& file, double scale) {
    std::vector<std::int32_t> soft;
    std::vector<Element> elements(values);
    const auto bytes = static_cast<std::streamsize>(values * sizeof(Element));
    for (std::uint64_t block = 0; block < count; ++block) {
        if (!stream.read(reinterpret_cast<char*>(elements.data()), bytes)) {
            throw fileError(file, fmt::format("ends within block {} of 0 to {}", block, count - 1),
                            "copy it again, it was cut short");
        }
        if constexpr (std::floating_point<Element>) {
            std::vector<std::int8_t> quantised(values);
            try {
                quantise(elements, quantised, scale);
            } catch (const std::invalid_argument&) {
                throw fileError(file,
                                fmt::format("block {} of 0 to {} has values that are not a number (NaN)",
                                            block, count - 1),
                                "give 0 for a bit that is unknown");
            }
            soft.insert(soft.end(), quantised.begin(), quantised.end());
        } else {
            soft.insert(soft.end(), elements.begin(), elements.end());
        }
    }
    return soft;
}

/// A type of elements that captures may have.
struct Type {
    const char* name;  ///< in headers
    bool isReal;
    std::vector<std::int32_t> (*read)(std::istream&, std::uint64_t, std::size_t, const std::string&, double);
};

constexpr std::array<Type, 5> types = {{{"|i1", false, &readBlocks<std::int8_t>},
                                        {"<i2", false, &readBlocks<std::int16_t>},
                                        {"<i4", false, &readBlocks<std::int32_t>},
                                        {"<f4", true, &readBlocks<float>},
                                        {"<f8", true, &readBlocks<double>}}};

/// The type that a header names.
/// @param isScaled  whether there is a scale, as real numbers need it
const Type& typeOf(const NpyHeader& header, const std::string& file, bool isScaled) {
    const auto type = std::find_if(types.begin(), types.end(),
                                   [&header](const Type& known) { return known.name == header.type; });
    const std::string problem = fmt::format("holds values of type '{}'", header.type);
    if (type == types.end()) {
        throw fileError(file, problem,
                        "save soft values as int8, int16 or int32, real numbers as float32 or float64, "
                        "little-endian");
    }
    if (type->isReal != isScaled) {
        throw fileError(
            file, problem,
            isScaled ? "integers are soft values already; leave out --llr and --scale" : realNumbersRemedy());
    }
    return *type;
}

}  // namespace

Capture readNpyCapture(std::istream& stream, const std::string& file, std::optional<double> scale) {
    const NpyHeader header = readNpyHeader(stream, file);
    const Type& type = typeOf(header, file, scale.has_value());
    requireCOrder(header, file);
    if (header.shape.size() != 3 || header.shape[1] != 3) {
        throw fileError(
            file, "has shape " + shapeText(header.shape),
            "a capture has shape (blocks, 3, K + 4), with systematic, parity 1, parity 2 in axis 1");
    }
    Capture capture;
    capture.blockSize = blockSizeOf(header.shape[2], file);
    if (header.shape[0] == 0) {
        throw fileError(file, "holds no block", "record at least one");
    }
    capture.soft =
        type.read(stream, header.shape[0], 3 * capture.positions(), file, scale.value_or(llrScale));
    requireEnd(stream, file);
    return capture;
}

std::string softNpy(std::span<const std::int8_t> soft, std::uint32_t K) {
    const std::size_t positions = K + tailPositions;
    const std::array<std::size_t, 3> shape = {soft.size() / (3 * positions), 3, positions};
    return xt::dump_npy(xt::adapt(soft.data(), soft.size(), xt::no_ownership(), shape));
}

}  // namespace quarzel::tool
