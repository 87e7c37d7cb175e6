// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "sweep/point_state.hpp"
#include "sweep/setup.hpp"
#include "sweep/stop_rule.hpp"

namespace quarzel::sweep {

/// The coded bits of a transmission, as a number or by the code rate.
struct CodedSize {
    std::uint32_t bits = 0;  ///< 0: by the rate
    double rate = 0;         ///< 0: each code bit once

    bool operator==(const CodedSize&) const = default;
};

/// What a user asks of a sweep: a point for every combination of the values in the lists.
struct Configuration {
    std::vector<std::uint32_t> blockSizes = {1024};
    std::vector<int> units = {2};
    std::vector<int> algorithms = {1};
    std::vector<int> iterations = {6};
    std::vector<link::Quantiser> quantisers = {link::Quantiser{}};
    std::vector<std::uint32_t> transportBlocks;  ///< instead of the block sizes, if there are any
    std::vector<CodedSize> codedSizes = {CodedSize{}};
    std::vector<link::Modulation> modulations = {link::Modulation::bpsk};
    std::vector<link::Fading> fadings = {link::Fading::none};
    std::vector<link::Demapping> demappings = {link::Demapping::maxLog};
    std::vector<unsigned> redundancyVersions = {0};
    Stop stop = Stop::none;
    std::vector<link::Decibels> ebN0;
    std::uint64_t seed = 1;
    StopRule stopRule;          ///< of every point
    double targetBler = 0;      ///< a curve ends at its first point with a lower block error rate; 0: never
    bool perIteration = false;  ///< count errors after every iteration

    /// How many combinations there are.
    std::size_t points() const;

    /// The points in their order, each once.
    std::vector<Setup> setups() const;

    /// How many times the errors of a block are counted: after every iteration with perIteration, else after
    /// the last one of each transmission.
    std::size_t countsOf(const Setup& setup) const {
        return perIteration ? static_cast<std::size_t>(setup.iterations) : setup.transmissions();
    }

    /// A point at which nothing has been counted.
    PointState startOf(const Setup& setup) const {
        const bool stops = setup.sending.stop != Stop::none;
        return PointState(countsOf(setup), stops ? static_cast<std::size_t>(setup.iterations) : 0);
    }

    /// @throws Error when a value is out of its range, a list empty or the points too many
    void check() const;
};

}  // namespace quarzel::sweep
