// SPDX-License-Identifier: MIT
#include "link/channel/fading_channel.hpp"

#include "link/channel/pam_demapping.hpp"

namespace quarzel::link {

namespace {

std::int8_t quantised(double soft) {
    const double raised = soft > INT8_MIN ? soft : INT8_MIN;
    const double clipped = raised < INT8_MAX ? raised : INT8_MAX;
    // Above 0, so that the part behind the point is cut off downwards.
    constexpr double shift = 0.5 - INT8_MIN;
    return static_cast<std::int8_t>(static_cast<int>(clipped + shift) + INT8_MIN);
}

}  // namespace

FadingChannel::FadingChannel(const ChannelSetup& setup, Decibels ebN0, CodeRate rate)
    : itsTables(FadingTables::get()),
      itsFading(setup.fading),
      itsIsExact(setup.demapping == Demapping::exact),
      itsComponents(setup.modulation == Modulation::bpsk ? 1 : 2),
      itsBits(bitsOfSymbol(setup.modulation) / itsComponents),
      itsLevels(amplitudes(setup.modulation).begin(), amplitudes(setup.modulation).end()) {
    const FreedCache freedCache;
    const Number variance = componentVariance(setup.modulation, ebN0, rate);
    itsDeviation = applied(mpfr_sqrt, variance).value();
    itsInverseVariance = (Number(1) / variance).value();
    Number scale(setup.quantiser.scale);
    if (setup.quantiser.kind == Quantiser::Kind::amplitude) {
        scale = scale * variance * Number(0.5);
    }
    itsScale = scale.value();
}

template <class Join>
FadingChannel::Ratios FadingChannel::ratios(double received, double amplitude, Join join) const {
    constexpr std::size_t maxLevels = std::size_t{1} << maxBits;
    // Of each level, ln of its likelihood but for what all have in common.
    std::array<double, maxLevels> likelihoods;
    for (std::size_t level = 0; level < itsLevels.size(); ++level) {
        const double sent = amplitude * itsLevels[level];
        likelihoods[level] = sent * (received - 0.5 * sent) * itsInverseVariance;
    }
    Ratios result{};
    for (std::size_t bit = 0; bit < itsBits; ++bit) {
        const std::size_t stride = itsLevels.size() >> (bit + 1);
        double zero = likelihoods[0];
        double one = likelihoods[stride];
        for (std::size_t level = 1; level < itsLevels.size(); ++level) {
            if ((level & stride) == 0) {
                zero = join(zero, likelihoods[level]);
            } else if (level != stride) {
                one = join(one, likelihoods[level]);
            }
        }
        result[bit] = one - zero;
    }
    return result;
}

FadingChannel::Ratios FadingChannel::ratios(double received, double amplitude) const {
    if (itsIsExact) {
        return ratios(received, amplitude, [this](double a, double b) { return itsTables.logSum(a, b); });
    }
    return ratios(received, amplitude, [](double a, double b) { return a > b ? a : b; });
}

void FadingChannel::transmit(const RandomSource& source, const std::uint8_t* codedBits, unsigned lane,
                             std::size_t count, std::int8_t* soft) const {
    const RandomSource fadingSource = itsFading == Fading::perBlock ? source.ofTransmission() : source;
    Draws fading(fadingSource, Purpose::fading, Purpose::fadingRefinement);
    Draws noise(source, Purpose::noise, Purpose::refinement);
    double amplitude = itsTables.amplitude(fading);
    for (std::size_t symbol = 0; symbol < count; symbol += itsComponents * itsBits) {
        if (symbol != 0 && itsFading == Fading::perSymbol) {
            amplitude = itsTables.amplitude(fading);
        }
        for (std::size_t component = symbol; component < symbol + itsComponents; ++component) {
            std::size_t level = 0;
            for (std::size_t bit = 0; bit < itsBits; ++bit) {
                level = 2 * level + (codedBits[component + itsComponents * bit] >> lane & 1U);
            }
            const double received = amplitude * itsLevels[level] + itsDeviation * itsTables.noise(noise);
            const Ratios values = ratios(received, amplitude);
            for (std::size_t bit = 0; bit < itsBits; ++bit) {
                soft[component + itsComponents * bit] = quantised(itsScale * values[bit]);
            }
        }
    }
}

}  // namespace quarzel::link
