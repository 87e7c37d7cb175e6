// SPDX-License-Identifier: MIT
#include "vectors/vector_coverage.hpp"

#include <fmt/format.h>

#include <limits>
#include <nlohmann/json.hpp>

#include "quarzel/code.hpp"
#include "vectors/memory_names.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;
using Limits = std::numeric_limits<std::int8_t>;

/// The window lengths of a segment.
std::vector<std::uint32_t> shapeOf(std::uint32_t K, std::uint32_t units) {
    const Layout layout = quarzel::layout(K, units);
    return {layout.window_steps, layout.window_steps + layout.windows};
}

/// The shapes that the blocks of all sizes have.
std::set<std::vector<std::uint32_t>> allShapes(std::uint32_t units) {
    std::set<std::vector<std::uint32_t>> shapes;
    for (const BlockSize& size : blockSizes()) {
        shapes.insert(shapeOf(size.K, units));
    }
    return shapes;
}

template <class Key>
Json countsOf(const std::map<Key, std::size_t>& counts) {
    Json object = Json::object();
    for (const auto& [key, count] : counts) {
        object[fmt::format("{}", key)] = count;
    }
    return object;
}

}  // namespace

void VectorCoverage::add(std::uint32_t K, int iterations, const std::string& stimulus,
                         const std::vector<std::int8_t>& soft, const std::vector<unsigned char>& decisions) {
    itsSizes.insert(K);
    itsShapes.insert(shapeOf(K, itsUnits));
    ++itsIterations[iterations];
    ++itsStimuli[stimulus];
    const std::size_t positions = soft.size() / itsStreams.size();
    for (std::size_t i = 0; i < soft.size(); ++i) {
        Stream& stream = itsStreams[i / positions];
        stream.low += soft[i] == Limits::min() ? 1 : 0;
        stream.zero += soft[i] == 0 ? 1 : 0;
        stream.high += soft[i] == Limits::max() ? 1 : 0;
    }
    for (const unsigned char bit : decisions) {
        ++itsDecisions[bit];
    }
    countCorrections(K, soft, decisions);
}

void VectorCoverage::countCorrections(std::uint32_t K, const std::vector<std::int8_t>& soft,
                                      const std::vector<unsigned char>& decisions) {
    const Layout layout = quarzel::layout(K, itsUnits);
    for (std::size_t i = 0; i < K; ++i) {
        const bool isCorrected = decisions[i] != 0 ? soft[i] < 0 : soft[i] > 0;
        const std::size_t segment = i / layout.segment_steps;
        std::size_t& place = layout.segments == 1             ? itsSingle
                             : segment == 0                   ? itsFirst
                             : segment + 1 == layout.segments ? itsLast
                                                              : itsMiddle;
        place += isCorrected ? 1 : 0;
    }
}

Json VectorCoverage::toJson() const {
    Json streams = Json::object();
    for (std::size_t i = 0; i < itsStreams.size(); ++i) {
        streams[softMemories[i]] = {
            {"-128", itsStreams[i].low}, {"0", itsStreams[i].zero}, {"127", itsStreams[i].high}};
    }
    return {{"block_sizes", {{"reached", itsSizes.size()}, {"of", blockSizes().size()}}},
            {"window_shapes", {{"reached", itsShapes.size()}, {"of", allShapes(itsUnits).size()}}},
            {"blocks_by_iterations", countsOf(itsIterations)},
            {"blocks_by_stimulus", countsOf(itsStimuli)},
            {"corrections_by_segment",
             {{"only", itsSingle}, {"first", itsFirst}, {"middle", itsMiddle}, {"last", itsLast}}},
            {"values_by_stream", streams},
            {"decisions", {{"0", itsDecisions[0]}, {"1", itsDecisions[1]}}}};
}

std::vector<std::string> VectorCoverage::missing() const {
    std::vector<std::string> names;
    const auto require = [&names](bool isReached, const std::string& name) {
        if (!isReached) {
            names.push_back(name);
        }
    };
    require(itsSizes.size() == blockSizes().size(), "a block size");
    require(itsShapes == allShapes(itsUnits), "a window shape");
    require(itsSingle > 0, "a correction in an only segment");
    require(itsFirst > 0, "a correction in a first segment");
    require(itsMiddle > 0, "a correction in a middle segment");
    require(itsLast > 0, "a correction in a last segment");
    for (std::size_t i = 0; i < itsStreams.size(); ++i) {
        require(itsStreams[i].low > 0, fmt::format("-128 in {}", softMemories[i]));
        require(itsStreams[i].high > 0, fmt::format("127 in {}", softMemories[i]));
    }
    return names;
}

}  // namespace quarzel::tool
