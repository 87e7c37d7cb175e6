// SPDX-License-Identifier: MIT
#include "sweep/configuration.hpp"

#include <algorithm>
#include <string>

#include "sweep/error.hpp"

namespace quarzel::sweep {

namespace {

constexpr std::size_t maxPoints = 10000;
constexpr std::uint64_t highestMaxBlocks = std::uint64_t{1} << 40;

/// Give every setup every value of a member.
template <class Value>
void multiply(std::vector<Setup>& setups, Value Setup::*member, const std::vector<Value>& values) {
    std::vector<Setup> all;
    for (const Value& value : values) {
        for (Setup setup : setups) {
            setup.*member = value;
            all.push_back(setup);
        }
    }
    setups = std::move(all);
}

void requireValues(bool isThere, const std::string& name) {
    if (!isThere) {
        throw Error("there is no " + name, "give at least one");
    }
}

}  // namespace

std::size_t Configuration::points() const {
    return blockSizes.size() * units.size() * algorithms.size() * iterations.size() * quantisers.size() *
           ebN0.size();
}

std::vector<Setup> Configuration::setups() const {
    std::vector<Setup> setups = {Setup{}};
    multiply(setups, &Setup::blockSize, blockSizes);
    multiply(setups, &Setup::units, units);
    multiply(setups, &Setup::algorithm, algorithms);
    multiply(setups, &Setup::iterations, iterations);
    multiply(setups, &Setup::quantiser, quantisers);
    multiply(setups, &Setup::ebN0, ebN0);
    std::sort(setups.begin(), setups.end());
    setups.erase(std::unique(setups.begin(), setups.end()), setups.end());
    return setups;
}

void Configuration::check() const {
    requireValues(!blockSizes.empty(), "block size");
    requireValues(!units.empty(), "number of units");
    requireValues(!algorithms.empty(), "algorithm");
    requireValues(!iterations.empty(), "number of iterations");
    requireValues(!quantisers.empty(), "quantiser");
    requireValues(!ebN0.empty(), "Eb/N0");
    if (stopRule.maxBlocks == 0 || stopRule.maxBlocks > highestMaxBlocks) {
        throw Error("the number of blocks is not from 1 to 2^40", "give one that is");
    }
    if (points() > maxPoints) {
        throw Error(
            "there are " + std::to_string(points()) + " points, more than " + std::to_string(maxPoints),
            "make a range shorter or its step larger");
    }
    for (const Setup& setup : setups()) {
        setup.check();
    }
}

}  // namespace quarzel::sweep
