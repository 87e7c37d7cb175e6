// SPDX-License-Identifier: MIT
#include "sweep/setup.hpp"

#include <fmt/format.h>

#include <stdexcept>

#include "quarzel/code.hpp"
#include "sweep/channels.hpp"
#include "sweep/error.hpp"

namespace quarzel::sweep {

namespace {

constexpr link::Decibels lowestEbN0 = {-20'000'000};
constexpr link::Decibels highestEbN0 = {40'000'000};

template <class Value>
void require(bool isPossible, const char* name, Value value, const char* wanted) {
    if (!isPossible) {
        throw Error(fmt::format("{} {} is not possible", name, value), fmt::format("give {}", wanted));
    }
}

/// What a coded link says of sizes that do not fit ends with those that do, if it names any.
void requireLink(const Setup& setup) {
    try {
        const link::CodedLink link(linkSetupOf(setup));
        require(link.segmentation().Kplus == setup.blockSize, "block size", setup.blockSize,
                "that of the last code block");
    } catch (const std::invalid_argument& error) {
        const std::string text = error.what();
        const std::size_t end = text.find("; ");
        throw end == std::string::npos ? Error(text, "give sizes that fit one another")
                                       : Error(text.substr(0, end), text.substr(end + 2));
    }
}

}  // namespace

std::uint32_t Setup::codedBits() const {
    constexpr auto tail = static_cast<std::uint32_t>(tailPositions);
    return sending.codedBits != 0 ? sending.codedBits : 3 * (blockSize + tail);
}

void Setup::check() const {
    require(findBlockSize(blockSize).has_value(), "block size", blockSize,
            "one of the 188 sizes of LTE, 40 to 6144");
    require(units == 2 || units == 4 || units == 8, "units", units, "2, 4 or 8");
    require(algorithm >= 0 && algorithm <= 2, "algorithm", algorithm, "0, 1 or 2");
    require(iterations >= 1 && iterations <= 15, "iterations", iterations, "a number from 1 to 15");
    require(quantiser.scale > 0 && quantiser.scale <= link::Quantiser::highestScale, "scale", quantiser.scale,
            "a number above 0 and up to 1000000");
    if (ebN0 < lowestEbN0 || ebN0 > highestEbN0) {
        throw Error("Eb/N0 lies outside -20 to 40 dB", "give values inside");
    }
    if (sending.stop == Stop::crc && sending.transportBlock == 0) {
        throw Error("code blocks alone have no CRC to stop at", "give transport blocks, or no stop");
    }
    if (!sending.isPlain()) {
        requireLink(*this);
    }
}

std::string_view nameOf(link::Quantiser::Kind kind) {
    return kind == link::Quantiser::Kind::llr ? "llr" : "scale";
}

std::optional<link::Quantiser::Kind> quantiserKindOf(std::string_view name) {
    for (const auto kind : {link::Quantiser::Kind::llr, link::Quantiser::Kind::amplitude}) {
        if (nameOf(kind) == name) {
            return kind;
        }
    }
    return std::nullopt;
}

bool isSameCurve(Setup a, const Setup& b) {
    a.ebN0 = b.ebN0;
    return a == b;
}

std::string curveText(const Setup& setup) {
    return fmt::format("K {}, {} units, algorithm {}, {} iteration{}, {} {}", setup.blockSize, setup.units,
                       setup.algorithm, setup.iterations, setup.iterations == 1 ? "" : "s",
                       nameOf(setup.quantiser.kind), setup.quantiser.scale) +
           sendingText(setup.sending);
}

std::string setupText(const Setup& setup) {
    return fmt::format("{}, {} dB", curveText(setup), setup.ebN0.value());
}

}  // namespace quarzel::sweep
