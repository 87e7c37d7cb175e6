// SPDX-License-Identifier: MIT
#include <algorithm>
#include <map>
#include <utility>

#include "sweep/error.hpp"
#include "sweep/part.hpp"

namespace quarzel::sweep {

namespace {

std::string shardText(const Shard& shard) {
    return std::to_string(shard.index + 1) + '/' + std::to_string(shard.count);
}

/// "1/8, 3/8 and 10 more".
std::string listText(const std::vector<std::uint64_t>& missing, std::uint64_t count) {
    constexpr std::size_t maxListed = 20;
    std::string text;
    for (std::size_t i = 0; i < std::min(missing.size(), maxListed); ++i) {
        text += (i == 0 ? "" : ", ") + shardText({missing[i], count});
    }
    return missing.size() > maxListed ? text + " and " + std::to_string(missing.size() - maxListed) + " more"
                                      : text;
}

/// @throws Error unless these are all the shards of one sweep, each once and complete
void requireWholeSet(const std::vector<NamedPart>& parts) {
    if (parts.empty()) {
        throw Error("there is no part", "give all shards of a sweep");
    }
    const NamedPart& first = parts.front();
    std::map<std::uint64_t, std::string> names;
    for (const auto& [name, part] : parts) {
        const std::string difference = differenceOf(part.configuration, first.part.configuration);
        if (!difference.empty() || part.shard.count != first.part.shard.count) {
            throw Error(name + " and " + first.name + " belong to different sweeps: " +
                            (difference.empty()
                                 ? "shards " + shardText(part.shard) + " and " + shardText(first.part.shard)
                                 : "the first has " + difference),
                        "give the shards of one sweep");
        }
        const auto [before, isNew] = names.emplace(part.shard.index, name);
        if (!isNew) {
            throw Error(name + " and " + before->second + " are both shard " + shardText(part.shard),
                        "give each shard once");
        }
    }
    std::vector<std::uint64_t> missing;
    for (std::uint64_t index = 0; index < first.part.shard.count; ++index) {
        if (!names.contains(index)) {
            missing.push_back(index);
        }
    }
    if (!missing.empty()) {
        throw Error(std::to_string(missing.size()) + " of " + std::to_string(first.part.shard.count) +
                        " shards are missing: " + listText(missing, first.part.shard.count),
                    "run them and give their files too");
    }
    for (const auto& [name, part] : parts) {
        if (!part.isComplete()) {
            throw Error(name + " is unfinished", "run its sweep to the end with --resume");
        }
    }
}

/// Join a point. A shard goes on until it alone has seen enough block errors or has no more blocks, so every
/// shard reaches the block where the point ends.
PointState mergePoint(const std::vector<NamedPart>& parts, std::size_t index,
                      const Configuration& configuration) {
    const std::size_t counts = parts.front().part.points[index].counts.size();
    std::vector<std::pair<std::uint64_t, const std::uint32_t*>> errors;
    for (const NamedPart& named : parts) {
        const ErrorList& list = named.part.points[index].errors;
        for (std::size_t i = 0; i < list.size(); ++i) {
            errors.emplace_back(list.blocks[i], list.row(i, counts));
        }
    }
    std::sort(errors.begin(), errors.end());
    PointState point(counts);
    point.blocks = configuration.maxBlocks;
    point.stoppedBy = StopReason::blocks;
    for (const auto& [block, row] : errors) {
        point.add(row);
        if (row[counts - 1] != 0 && point.last().blockErrors == configuration.maxBlockErrors) {
            point.blocks = block + 1;
            point.stoppedBy = StopReason::blockErrors;
            break;
        }
    }
    return point;
}

}  // namespace

Result merge(const std::vector<NamedPart>& parts) {
    requireWholeSet(parts);
    const Part& first = parts.front().part;
    Result result{first.configuration, first.points};
    if (!first.shard.isWhole()) {
        for (std::size_t i = 0; i < result.points.size(); ++i) {
            result.points[i] = mergePoint(parts, i, first.configuration);
        }
    }
    return result;
}

}  // namespace quarzel::sweep
