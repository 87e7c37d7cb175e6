// SPDX-License-Identifier: MIT
#include "sweep/merge.hpp"

#include <algorithm>
#include <map>
#include <tuple>
#include <utility>

#include "sweep/error.hpp"

namespace quarzel::sweep {

namespace {

using PartsByIndex = std::map<std::uint64_t, const NamedResult*>;

std::string shardText(std::uint64_t index, std::uint64_t count) {
    return std::to_string(index + 1) + '/' + std::to_string(count);
}

/// "1/8, 3/8 and 10 more".
std::string listText(const std::vector<std::uint64_t>& missing, std::uint64_t count) {
    constexpr std::size_t maxListed = 20;
    std::string text;
    for (std::size_t i = 0; i < std::min(missing.size(), maxListed); ++i) {
        text += (i == 0 ? "" : ", ") + shardText(missing[i], count);
    }
    return missing.size() > maxListed ? text + " and " + std::to_string(missing.size() - maxListed) + " more"
                                      : text;
}

/// Whether the errors of the first blocks of a point can be those of a point with no fewer blocks.
bool canBeginAs(const PointState& longer, const PointState& shorter) {
    if (longer.blocks == shorter.blocks) {
        return longer.last() == shorter.last() && longer.bitErrorSquares == shorter.bitErrorSquares;
    }
    return shorter.last().bitErrors <= longer.last().bitErrors &&
           shorter.last().blockErrors <= longer.last().blockErrors;
}

/// Which of two states of a point tells more: the greater one.
auto extentOf(const PointState& point) {
    const int reason =
        point.stoppedBy ? -static_cast<int>(*point.stoppedBy) : -static_cast<int>(StopReason::time) - 1;
    return std::tuple(point.blocks, point.counts.size(), reason);
}

/// @throws Error unless these are all the shards of one sweep, each complete
void requireWhole(const PartsByIndex& parts) {
    const NamedResult& first = *parts.begin()->second;
    const std::uint64_t count = first.result.part->shard.count;
    std::vector<std::uint64_t> missing;
    for (std::uint64_t index = 0; index < count; ++index) {
        if (!parts.contains(index)) {
            missing.push_back(index);
        }
    }
    if (!missing.empty()) {
        throw Error(std::to_string(missing.size()) + " of " + std::to_string(count) +
                        " shards of the sweep of " + first.name + " are missing: " + listText(missing, count),
                    "run them and give their files too");
    }
    for (const auto& [index, part] : parts) {
        const Points& points = part->result.points;
        if (!std::all_of(points.begin(), points.end(),
                         [](const auto& point) { return point.second.stoppedBy.has_value(); })) {
            throw Error(part->name + " is unfinished", "run its sweep to the end with --resume");
        }
    }
}

/// Add the blocks of another shard to a point.
void add(PointState& sum, const PointState& point) {
    sum.blocks += point.blocks;
    sum.bitErrorSquares += point.bitErrorSquares;
    for (std::size_t i = 0; i < sum.counts.size(); ++i) {
        sum.counts[i].bitErrors += point.counts.at(i).bitErrors;
        sum.counts[i].blockErrors += point.counts.at(i).blockErrors;
        sum.counts[i].undetected += point.counts.at(i).undetected;
    }
    for (std::size_t i = 0; i < sum.iterationsUsed.size(); ++i) {
        sum.iterationsUsed[i] += point.iterationsUsed.at(i);
    }
}

NamedResult sumOf(const PartsByIndex& parts) {
    requireWhole(parts);
    const NamedResult& first = *parts.begin()->second;
    NamedResult sum{first.name, {first.result.seed, {}, {}}};
    for (const auto& [index, part] : parts) {
        for (const auto& [setup, point] : part->result.points) {
            const auto [place, isNew] = sum.result.points.emplace(setup, point);
            if (!isNew) {
                add(place->second, point);
            }
        }
    }
    return sum;
}

}  // namespace

void join(NamedResult& to, const NamedResult& from) {
    if (to.result.seed != from.result.seed) {
        throw Error(from.name + " has seed " + std::to_string(from.result.seed) + " and " + to.name +
                        " seed " + std::to_string(to.result.seed),
                    "only results of one seed can be joined");
    }
    for (const auto& [setup, point] : from.result.points) {
        PointState& known = to.result.points.try_emplace(setup, point).first->second;
        const bool isLonger = extentOf(point) > extentOf(known);
        if (!(isLonger ? canBeginAs(point, known) : canBeginAs(known, point))) {
            throw Error(from.name + " and " + to.name + " contradict each other at " + setupText(setup),
                        "find the wrong one with 'quarzel verify-result'");
        }
        if (isLonger) {
            known = point;
        }
    }
}

Result merge(const std::vector<NamedResult>& results) {
    std::map<std::pair<std::string, std::uint64_t>, PartsByIndex> sweeps;
    std::vector<NamedResult> whole;
    for (const NamedResult& named : results) {
        if (!named.result.part) {
            whole.push_back(named);
            continue;
        }
        const auto& [shard, sweep] = *named.result.part;
        const auto [before, isNew] = sweeps[{sweep, shard.count}].emplace(shard.index, &named);
        if (!isNew) {
            throw Error(named.name + " and " + before->second->name + " are both shard " +
                            shardText(shard.index, shard.count),
                        "give each shard once");
        }
    }
    for (const auto& [sweep, parts] : sweeps) {
        whole.push_back(sumOf(parts));
    }
    if (whole.empty()) {
        throw Error("there is nothing to join", "give results, or all parts of a sweep");
    }
    NamedResult merged{whole.front().name, {whole.front().result.seed, {}, {}}};
    for (const NamedResult& named : whole) {
        join(merged, named);
    }
    return merged.result;
}

}  // namespace quarzel::sweep
