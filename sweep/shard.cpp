// SPDX-License-Identifier: MIT
#include "sweep/shard.hpp"

#include <algorithm>
#include <cstddef>

#include "sweep/predicted_cost.hpp"

namespace quarzel::sweep {

namespace {

struct Weighed {
    double cost;
    std::size_t number;
};

}  // namespace

bool dividesBlocks(const StopRule& rule) {
    return rule.maxBlockErrors == 0;
}

std::vector<Setup> setupsOf(const Configuration& configuration, const Shard& shard) {
    std::vector<Setup> all = configuration.setups();
    if (shard.isWhole() || dividesBlocks(configuration.stopRule)) {
        return all;
    }
    std::vector<Weighed> heaviestFirst;
    for (std::size_t i = 0; i < all.size(); ++i) {
        heaviestFirst.push_back({predictedCost(all[i], configuration.stopRule), i});
    }
    std::stable_sort(heaviestFirst.begin(), heaviestFirst.end(),
                     [](const Weighed& a, const Weighed& b) { return a.cost > b.cost; });
    std::vector<double> loads(shard.count, 0.0);
    std::vector<Setup> dealt;
    for (const auto& [cost, number] : heaviestFirst) {
        const auto lightest = std::min_element(loads.begin(), loads.end());
        *lightest += cost;
        if (static_cast<std::uint64_t>(lightest - loads.begin()) == shard.index) {
            dealt.push_back(all[number]);
        }
    }
    std::sort(dealt.begin(), dealt.end());
    return dealt;
}

}  // namespace quarzel::sweep
