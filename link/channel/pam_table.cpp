// SPDX-License-Identifier: MIT
#include "link/channel/pam_table.hpp"

#include <algorithm>
#include <cmath>
#include <cstddef>

#include "link/channel/pam_demapping.hpp"
#include "link/noise_tables.hpp"

namespace quarzel::link {

namespace {

/// Where a soft value changes.
struct Cut {
    Number received;
    std::size_t bit;
    int soft;  ///< above the cut
};

/// Rounded to the nearest whole number and clipped.
int quantised(const Number& soft) {
    Number rounded;
    mpfr_add_d(rounded.get(), soft.get(), 0.5, MPFR_RNDN);
    mpfr_floor(rounded.get(), rounded.get());
    return static_cast<int>(std::clamp(rounded.value(), double{INT8_MIN}, double{INT8_MAX}));
}

/// A place and how far the soft value is from the one that is looked for.
struct Sample {
    Number received;
    Number difference;

    bool isBelow() const { return mpfr_sgn(difference.get()) < 0; }
};

/// Where a soft value is `target`, between two places on either side of it: false position with the weight of
/// an end halved that stays (the Illinois rule).
Number crossing(const PamDemapping& demapping, std::size_t bit, const Number& target, Sample a, Sample b) {
    constexpr double closeEnough = 0x1p-70;
    for (Number last = a.received;;) {
        const Number place =
            (a.received * b.difference - b.received * a.difference) / (b.difference - a.difference);
        const Sample now = {place, demapping.soft(bit, place) - target};
        const Number move = place - last;
        if (mpfr_zero_p(now.difference.get()) != 0 || std::abs(move.value()) < closeEnough) {
            return place;
        }
        last = place;
        if (now.isBelow() != b.isBelow()) {
            a = b;
        } else {
            a.difference = a.difference * Number(0.5);
        }
        b = now;
    }
}

/// The cuts of a step, at whose ends the soft values of a bit are known.
void cutStep(const PamDemapping& demapping, std::size_t bit, const Sample& from, const Sample& to,
             std::vector<Cut>& cuts) {
    const int first = quantised(from.difference);
    const int last = quantised(to.difference);
    const int direction = last > first ? 1 : -1;
    for (int soft = first; soft != last; soft += direction) {
        const Number target(soft + 0.5 * direction);
        cuts.push_back({crossing(demapping, bit, target, {from.received, from.difference - target},
                                 {to.received, to.difference - target}),
                        bit, soft + direction});
    }
}

}  // namespace

PamTable makePamTable(const ChannelSetup& setup, Decibels ebN0, CodeRate rate) {
    const FreedCache freedCache;
    const auto levels = amplitudes(setup.modulation);
    const Number variance = componentVariance(setup.modulation, ebN0, rate);
    const PamDemapping demapping(setup, variance);
    const Number deviationRoot2 = rootOfTwice(variance);
    // Beyond, no value is received in 2^48. Steps begin at a whole number.
    const auto end = static_cast<double>(mpfr_get_si((Number(7) * deviationRoot2).get(), MPFR_RNDU) +
                                         *std::max_element(levels.begin(), levels.end()));

    PamTable table;
    PamSoft soft{};
    std::vector<Cut> cuts;
    for (std::size_t bit = 0; bit < demapping.bits(); ++bit) {
        Sample from = {Number(-end), demapping.soft(bit, Number(-end))};
        soft[bit] = static_cast<std::int8_t>(quantised(from.difference));
        for (double place = -end + demapping.step(); place <= end; place += demapping.step()) {
            const Sample to = {Number(place), demapping.soft(bit, Number(place))};
            cutStep(demapping, bit, from, to, cuts);
            from = to;
        }
    }
    std::stable_sort(cuts.begin(), cuts.end(),
                     [](const Cut& a, const Cut& b) { return a.received < b.received; });
    table.soft.push_back(soft);
    for (const Cut& cut : cuts) {
        soft[cut.bit] = static_cast<std::int8_t>(cut.soft);
        table.soft.push_back(soft);
    }
    for (const std::int8_t level : levels) {
        std::vector<std::uint64_t>& thresholds = table.thresholds.emplace_back();
        for (const Cut& cut : cuts) {
            thresholds.push_back(probabilityAbove(Number(level) - cut.received, deviationRoot2));
        }
    }
    return table;
}

}  // namespace quarzel::link
