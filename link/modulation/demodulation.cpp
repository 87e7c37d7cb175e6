// SPDX-License-Identifier: MIT
#include "link/modulation/demodulation.hpp"

#include <algorithm>
#include <array>
#include <cmath>
#include <limits>
#include <stdexcept>
#include <string>

#include "link/choice.hpp"
#include "link/coding/require.hpp"

namespace quarzel::link {

namespace {

/// How far a component of a symbol is from each amplitude that `bitCount` bits choose from.
template <std::size_t bitCount>
class Distances {
  public:
    Distances(Modulation modulation, Demapping demapping) : itsDemapping(demapping) {
        const double unit = amplitudeUnit(modulation);
        std::transform(amplitudes(modulation).begin(), amplitudes(modulation).end(), itsLevels.begin(),
                       [unit](std::int8_t level) { return unit * level; });
    }

    /// Take the squares of the distances over the variance of the noise.
    void measure(double component, double inverseVariance) {
        for (std::size_t i = 0; i < itsSquares.size(); ++i) {
            itsSquares[i] = (component - itsLevels[i]) * (component - itsLevels[i]) * inverseVariance;
        }
        if (isExact()) {
            const double least = *std::min_element(itsSquares.begin(), itsSquares.end());
            std::transform(itsSquares.begin(), itsSquares.end(), itsPowers.begin(),
                           [least](double square) { return std::exp(least - square); });
        }
    }

    /// ln P(1) / P(0) of a bit, 0 the first one.
    double ratio(std::size_t bit) const {
        const auto add = [](double a, double b) { return a + b; };
        if (!isExact()) {
            return maxLogRatio(bit);
        }
        const Pair sums = fold(itsPowers, bit, 0, add);
        constexpr double safelyNormal = 1e-250;
        if (std::min(sums[0], sums[1]) > safelyNormal) {
            return std::log(sums[1] / sums[0]);
        }
        // One of them is next to nothing: make each relative to its own nearest level.
        const Pair least = leastSquares(bit);
        const Pair relative = {
            fold(itsSquares, bit, 0, [&](double a, double b) { return a + std::exp(least[0] - b); })[0],
            fold(itsSquares, bit, 0, [&](double a, double b) { return a + std::exp(least[1] - b); })[1]};
        return maxLogRatio(bit) + std::log(relative[1] / relative[0]);
    }

  private:
    static constexpr std::size_t levelCount = std::size_t{1} << bitCount;
    using Levels = std::array<double, levelCount>;
    using Pair = std::array<double, 2>;  ///< for bit 0 and for bit 1

    /// With one bit there is one level for each value, and both methods agree.
    bool isExact() const { return bitCount > 1 && itsDemapping == Demapping::exact; }

    /// Join the values of the levels that have a bit of 0, and those that have 1.
    template <class Join>
    static Pair fold(const Levels& values, std::size_t bit, double start, Join join) {
        const std::size_t stride = levelCount >> (bit + 1);
        Pair result = {start, start};
        for (std::size_t base = 0; base < levelCount; base += 2 * stride) {
            for (std::size_t i = base; i < base + stride; ++i) {
                result[0] = join(result[0], values[i]);
                result[1] = join(result[1], values[i + stride]);
            }
        }
        return result;
    }

    Pair leastSquares(std::size_t bit) const {
        return fold(itsSquares, bit, std::numeric_limits<double>::infinity(),
                    [](double a, double b) { return std::min(a, b); });
    }

    double maxLogRatio(std::size_t bit) const {
        const Pair least = leastSquares(bit);
        return least[0] - least[1];
    }

    Demapping itsDemapping;
    Levels itsLevels{};
    Levels itsSquares{};
    Levels itsPowers{};  ///< of e, relative to the nearest level
};

void requireVariances(std::span<const double> variances, std::size_t symbols) {
    if (variances.size() != 1) {
        requireSize("noise variances, or 1", variances.size(), symbols);
    }
    for (const double variance : variances) {
        if (!(variance > 0)) {
            throw std::invalid_argument("a noise variance must be above 0, not " + std::to_string(variance));
        }
    }
}

double inverseVariance(std::span<const double> variances, std::size_t n) {
    return 1 / variances[variances.size() == 1 ? 0 : n];
}

/// Both components carry the one bit.
void demodulateDiagonal(std::span<const std::complex<double>> symbols, std::span<const double> variances,
                        std::span<double> ratios) {
    const double factor = -4 * amplitudeUnit(Modulation::bpsk);
    for (std::size_t n = 0; n < symbols.size(); ++n) {
        ratios[n] = factor * (symbols[n].real() + symbols[n].imag()) * inverseVariance(variances, n);
    }
}

/// The components carry `bitCount` bits each, in turns.
template <std::size_t bitCount>
void demodulateComponents(std::span<const std::complex<double>> symbols, Modulation modulation,
                          std::span<const double> variances, std::span<double> ratios, Demapping demapping) {
    Distances<bitCount> distances(modulation, demapping);
    double* ratio = ratios.data();
    for (std::size_t n = 0; n < symbols.size(); ++n) {
        const std::array<double, 2> components = {symbols[n].real(), symbols[n].imag()};
        for (std::size_t i = 0; i < components.size(); ++i) {
            distances.measure(components[i], inverseVariance(variances, n));
            for (std::size_t bit = 0; bit < bitCount; ++bit) {
                ratio[2 * bit + i] = distances.ratio(bit);
            }
        }
        ratio += 2 * bitCount;
    }
}

}  // namespace

Demapping demappingOf(std::string_view name) {
    return static_cast<Demapping>(placeOf(demappingNames, name, "method of demodulation"));
}

void demodulate(std::span<const std::complex<double>> symbols, Modulation modulation,
                std::span<const double> noiseVariances, std::span<double> ratios, Demapping demapping) {
    requireVariances(noiseVariances, symbols.size());
    requireSize("ratios", ratios.size(), bitsOfSymbol(modulation) * symbols.size());
    switch (modulation) {
        case Modulation::bpsk:
            return demodulateDiagonal(symbols, noiseVariances, ratios);
        case Modulation::qpsk:
            return demodulateComponents<1>(symbols, modulation, noiseVariances, ratios, demapping);
        case Modulation::qam16:
            return demodulateComponents<2>(symbols, modulation, noiseVariances, ratios, demapping);
        case Modulation::qam64:
            return demodulateComponents<3>(symbols, modulation, noiseVariances, ratios, demapping);
        case Modulation::qam256:
            return demodulateComponents<4>(symbols, modulation, noiseVariances, ratios, demapping);
    }
}

}  // namespace quarzel::link
