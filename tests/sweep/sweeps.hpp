// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>

#include "sweep/part.hpp"
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
    configuration.maxBlocks = 301;
    configuration.maxBlockErrors = 50;
    configuration.seed = 7;
    return configuration;
}

inline void run(sweep::Dispatcher& dispatcher, unsigned threads) {
    sweep::Observer none;
    sweep::ThreadWorkers(threads).run(dispatcher, none);
}

inline sweep::Result resultOf(const sweep::Configuration& configuration, unsigned threads = 1) {
    sweep::Dispatcher dispatcher({configuration});
    run(dispatcher, threads);
    return {configuration, dispatcher.states()};
}

inline sweep::NamedPart partOf(const sweep::Configuration& configuration, const sweep::Shard& shard) {
    sweep::Dispatcher dispatcher({configuration, shard});
    run(dispatcher, 1);
    return {"part " + std::to_string(shard.index + 1), {configuration, shard, dispatcher.states()}};
}

}  // namespace quarzel::test
