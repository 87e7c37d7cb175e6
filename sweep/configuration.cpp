// SPDX-License-Identifier: MIT
#include "sweep/configuration.hpp"

#include <algorithm>
#include <string>

#include "link/chain/coded_link.hpp"
#include "link/coding/crc.hpp"
#include "link/coding/segmentation.hpp"
#include "quarzel/code.hpp"
#include "sweep/error.hpp"

namespace quarzel::sweep {

namespace {

constexpr std::size_t maxPoints = 10000;
constexpr std::uint64_t highestMaxBlocks = std::uint64_t{1} << 40;

/// Give every setup every value.
/// @param give  gives one to a setup
template <class Value, class Give>
void multiply(std::vector<Setup>& setups, const std::vector<Value>& values, Give give) {
    std::vector<Setup> all;
    for (const Value& value : values) {
        for (Setup setup : setups) {
            give(setup, value);
            all.push_back(setup);
        }
    }
    setups = std::move(all);
}

template <class Value>
void multiply(std::vector<Setup>& setups, Value Setup::*member, const std::vector<Value>& values) {
    multiply(setups, values, [member](Setup& setup, const Value& value) { setup.*member = value; });
}

template <class Value>
void multiply(std::vector<Setup>& setups, Value Sending::*member, const std::vector<Value>& values) {
    multiply(setups, values, [member](Setup& setup, const Value& value) { setup.sending.*member = value; });
}

void giveTransportBlock(Setup& setup, std::uint32_t A) {
    setup.sending.transportBlock = A;
    setup.blockSize = link::segmentationOf(A + std::size_t{link::crcLength(link::Crc::crc24A)}).Kplus;
}

/// A rate is taken to whole symbols. What sends each code bit once is one setup, however it is told.
void giveCodedSize(Setup& setup, const CodedSize& size) {
    Sending& sending = setup.sending;
    const unsigned unit = link::bitsOfSymbol(sending.modulation);
    sending.codedBits = size.bits;
    if (size.bits == 0 && size.rate != 0) {
        sending.codedBits =
            static_cast<std::uint32_t>(link::codedBitsOfRate(setup.informationBits(), size.rate, unit));
    }
    if (sending.transportBlock == 0 && sending.codedBits == 3 * (setup.blockSize + tailPositions)) {
        sending.codedBits = 0;
    }
}

void requireValues(bool isThere, const std::string& name) {
    if (!isThere) {
        throw Error("there is no " + name, "give at least one");
    }
}

}  // namespace

std::size_t Configuration::points() const {
    const std::size_t sizes = transportBlocks.empty() ? blockSizes.size() : transportBlocks.size();
    return sizes * units.size() * algorithms.size() * iterations.size() * quantisers.size() *
           modulations.size() * codedSizes.size() * fadings.size() * demappings.size() * ebN0.size();
}

std::vector<Setup> Configuration::setups() const {
    std::vector<Setup> setups = {Setup{}};
    setups.front().sending.redundancyVersions = redundancyVersions;
    setups.front().sending.stop = stop;
    if (transportBlocks.empty()) {
        multiply(setups, &Setup::blockSize, blockSizes);
    } else {
        multiply(setups, transportBlocks, giveTransportBlock);
    }
    multiply(setups, &Sending::modulation, modulations);
    multiply(setups, codedSizes, giveCodedSize);
    multiply(setups, &Sending::fading, fadings);
    multiply(setups, &Sending::demapping, demappings);
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
    requireValues(!codedSizes.empty(), "number of coded bits");
    requireValues(!modulations.empty(), "modulation");
    requireValues(!fadings.empty(), "channel");
    requireValues(!demappings.empty(), "demapping");
    if (perIteration && (redundancyVersions.size() > 1 || stop != Stop::none)) {
        throw Error("errors are counted after every iteration of one transmission without a stop",
                    "leave out --per-iteration, or --harq, --rv and --stop");
    }
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
