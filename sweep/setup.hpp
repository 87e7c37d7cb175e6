// SPDX-License-Identifier: MIT
#pragma once

#include <compare>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "link/channel_thresholds.hpp"
#include "link/decibels.hpp"
#include "sweep/sending.hpp"

namespace quarzel::sweep {

/// What is simulated at a point. Points that differ in Eb/N0 alone make a curve. The order of the members is
/// the order of points in files and tables.
struct Setup {
    std::uint32_t blockSize = 1024;  ///< K; of transport blocks that of the last code block
    int units = 2;                   ///< processing units: 2, 4 or 8
    int algorithm = 1;               ///< 0 max-log, 1 max-log with scaling, 2 max-star
    int iterations = 6;              ///< 1 to 15
    link::Quantiser quantiser;
    Sending sending;
    link::Decibels ebN0;  ///< of an information bit; the code rate is taken as 1/3 unless blocks are coded

    auto operator<=>(const Setup&) const = default;

    /// K, or A of transport blocks.
    std::uint32_t informationBits() const {
        return sending.transportBlock != 0 ? sending.transportBlock : blockSize;
    }

    /// How often a block is sent at most.
    std::size_t transmissions() const { return sending.redundancyVersions.size(); }

    /// The coded bits of a transmission.
    std::uint32_t codedBits() const;

    /// @throws Error when a value is out of its range or sizes do not fit one another
    void check() const;
};

/// Call a function for each field of a curve that files always have: its name in files and CSV, and the
/// member.
template <class AnySetup, class Function>
void forEachField(AnySetup& setup, Function function) {
    function("block_size", setup.blockSize);
    function("units", setup.units);
    function("algorithm", setup.algorithm);
    function("iterations", setup.iterations);
    function("quantiser", setup.quantiser.kind);
    function("scale", setup.quantiser.scale);
}

/// How files and the options of the tool call a kind of quantiser.
std::string_view nameOf(link::Quantiser::Kind kind);
std::optional<link::Quantiser::Kind> quantiserKindOf(std::string_view name);

bool isSameCurve(Setup a, const Setup& b);

/// "K 1024, 2 units, algorithm 1, 8 iterations, llr 4".
std::string curveText(const Setup& setup);

/// The same with ", 0.4 dB".
std::string setupText(const Setup& setup);

}  // namespace quarzel::sweep
