// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "link/channel_thresholds.hpp"
#include "link/decibels.hpp"

namespace quarzel::sweep {

/// A core and its block size; it gives one curve over Eb/N0.
struct Curve {
    std::uint32_t blockSize;  ///< K
    int units;                ///< processing units: 2, 4 or 8
    int algorithm;            ///< 0 max-log, 1 max-log with scaling, 2 max-star
    int iterations;           ///< 1 to 15
};

/// All that the result of a sweep depends on. Every combination of block size, units, algorithm
/// and iterations makes a curve, every Eb/N0 a point of it.
struct Configuration {
    std::vector<std::uint32_t> blockSizes = {1024};
    std::vector<int> units = {2};
    std::vector<int> algorithms = {1};
    std::vector<int> iterations = {6};
    std::vector<link::Decibels> ebN0;  ///< of an information bit; the code rate is taken as 1/3
    link::Quantiser quantiser = {link::Quantiser::Kind::llr, 4};
    std::uint64_t seed = 1;
    std::uint64_t maxBlocks = 10000;     ///< a point ends after this many blocks
    std::uint64_t maxBlockErrors = 100;  ///< or at this many block errors; 0: no limit
    std::uint64_t maxSeconds = 0;        ///< or after this time; 0: no limit
    bool perIteration = false;           ///< count errors after every iteration

    /// The curves in their order: block sizes outermost, iterations innermost.
    std::vector<Curve> curves() const;

    /// Points of all curves. Point p is Eb/N0 number p % ebN0.size() of curve p / ebN0.size().
    std::size_t points() const;

    /// How many times the errors of a block are counted: after every iteration with perIteration, else after
    /// the last one.
    std::size_t countsOf(const Curve& curve) const {
        return perIteration ? static_cast<std::size_t>(curve.iterations) : 1;
    }

    /// @throws Error when a value is out of its range, a list empty or the points too many
    void check() const;

    bool operator==(const Configuration&) const = default;
};

/// The part of every point that one run decodes: the octets of blocks whose number leaves the remainder
/// `index` modulo `count`.
struct Shard {
    std::uint64_t index = 0;
    std::uint64_t count = 1;

    bool isWhole() const { return count == 1; }
    bool operator==(const Shard&) const = default;
};

}  // namespace quarzel::sweep
