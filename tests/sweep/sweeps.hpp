// SPDX-License-Identifier: MIT
#pragma once

#include <iterator>
#include <string>
#include <vector>

#include "sweep/merge.hpp"
#include "sweep/run.hpp"

namespace quarzel::test {

/// A sweep that takes no time and yet has everything: two sizes, two cores, points that end by errors inside
/// an octet of blocks and points that end by blocks, and a last octet that is short.
inline sweep::Configuration smallSweep() {
    sweep::Configuration configuration;
    configuration.blockSizes = {40, 104};
    configuration.algorithms = {0, 2};
    configuration.iterations = {3};
    configuration.ebN0 = {{0}, {1'500'000}, {3'000'000}};
    configuration.stopRule.maxBlocks = 301;
    configuration.stopRule.maxBlockErrors = 50;
    configuration.seed = 7;
    return configuration;
}

/// Code blocks alone over several transmissions with fading, of which a part is punctured and a part
/// repeated.
inline sweep::Configuration codedSweep() {
    sweep::Configuration configuration = smallSweep();
    configuration.blockSizes = {104};
    configuration.algorithms = {1};
    configuration.codedSizes = {{0, 0.75}, {480, 0}};
    configuration.modulations = {link::Modulation::qam16};
    configuration.fadings = {link::Fading::none, link::Fading::perSymbol};
    configuration.demappings = {link::Demapping::exact};
    configuration.redundancyVersions = {0, 2, 3};
    configuration.ebN0 = {{1'000'000}, {5'000'000}};
    return configuration;
}

/// Transport blocks of one and of several code blocks, and a receiver that stops.
inline sweep::Configuration transportSweep() {
    sweep::Configuration configuration = codedSweep();
    configuration.transportBlocks = {90, 6200};
    configuration.codedSizes = {{0, 0.5}};
    configuration.modulations = {link::Modulation::qpsk};
    configuration.fadings = {link::Fading::perBlock};
    configuration.demappings = {link::Demapping::maxLog};
    configuration.redundancyVersions = {0, 3};
    configuration.stop = sweep::Stop::crc;
    configuration.stopRule.maxBlocks = 61;
    configuration.stopRule.maxBlockErrors = 11;
    return configuration;
}

/// One of each kind.
inline std::vector<sweep::Configuration> everyKindOfSweep() {
    return {smallSweep(), codedSweep(), transportSweep()};
}

inline void run(sweep::Dispatcher& dispatcher, unsigned threads) {
    sweep::Observer none;
    sweep::ThreadWorkers(threads).run(dispatcher, none);
}

inline sweep::Result resultOf(const sweep::Configuration& configuration, unsigned threads = 1,
                              const sweep::Points& known = {}) {
    sweep::Dispatcher dispatcher(sweep::planOf(configuration, {}, known));
    run(dispatcher, threads);
    return {configuration.seed, dispatcher.points(), {}};
}

inline sweep::NamedResult partResult(const sweep::Configuration& configuration, const sweep::Shard& shard) {
    sweep::Dispatcher dispatcher(sweep::planOf(configuration, shard));
    run(dispatcher, 1);
    return {"part " + std::to_string(shard.index + 1),
            {configuration.seed, dispatcher.points(), sweep::partOf(configuration, shard)}};
}

inline std::vector<sweep::NamedResult> partsOf(const sweep::Configuration& configuration,
                                               std::uint64_t count) {
    std::vector<sweep::NamedResult> parts;
    for (std::uint64_t index = count; index-- > 0;) {
        parts.push_back(partResult(configuration, {index, count}));
    }
    return parts;
}

/// The result of simulating the points of another one again.
inline sweep::Result repeated(sweep::Result result) {
    sweep::Dispatcher dispatcher(sweep::repetitionOf(result.seed, result.points));
    run(dispatcher, 2);
    result.points = dispatcher.points();
    return result;
}

/// A point by its place in the order.
inline sweep::PointState& pointAt(sweep::Result& result, std::size_t number) {
    return std::next(result.points.begin(), static_cast<std::ptrdiff_t>(number))->second;
}

}  // namespace quarzel::test
