// SPDX-License-Identifier: MIT
#include "sweep/configuration.hpp"

#include <algorithm>
#include <cmath>
#include <string>

#include "quarzel/code.hpp"
#include "sweep/error.hpp"

namespace quarzel::sweep {

namespace {

constexpr std::size_t maxPoints = 10000;
constexpr std::uint64_t highestMaxBlocks = std::uint64_t{1} << 40;
constexpr link::Decibels lowestEbN0 = {-20'000'000};
constexpr link::Decibels highestEbN0 = {40'000'000};

template <class T, class IsValid>
void checkEach(const std::vector<T>& list, const std::string& name, const std::string& wanted,
               IsValid isValid) {
    if (list.empty()) {
        throw Error("there is no value for " + name, "give at least one");
    }
    for (const T& value : list) {
        if (!isValid(value)) {
            throw Error(name + " " + std::to_string(value) + " is not possible", "give " + wanted);
        }
    }
}

}  // namespace

std::vector<Curve> Configuration::curves() const {
    std::vector<Curve> curves;
    for (const std::uint32_t K : blockSizes) {
        for (const int unit : units) {
            for (const int algorithm : algorithms) {
                for (const int count : iterations) {
                    curves.push_back({K, unit, algorithm, count});
                }
            }
        }
    }
    return curves;
}

std::size_t Configuration::points() const {
    return blockSizes.size() * units.size() * algorithms.size() * iterations.size() * ebN0.size();
}

void Configuration::check() const {
    checkEach(blockSizes, "block size", "one of the 188 sizes of LTE, 40 to 6144",
              [](std::uint32_t K) { return findBlockSize(K).has_value(); });
    checkEach(units, "units", "2, 4 or 8", [](int n) { return n == 2 || n == 4 || n == 8; });
    checkEach(algorithms, "algorithm", "0, 1 or 2", [](int n) { return n >= 0 && n <= 2; });
    checkEach(iterations, "iterations", "a number from 1 to 15", [](int n) { return n >= 1 && n <= 15; });
    if (ebN0.empty()) {
        throw Error("there is no Eb/N0", "give at least one");
    }
    const auto [lowest, highest] = std::minmax_element(ebN0.begin(), ebN0.end());
    if (*lowest < lowestEbN0 || *highest > highestEbN0) {
        throw Error("Eb/N0 lies outside -20 to 40 dB", "give values inside");
    }
    if (!(quantiser.scale > 0) || !(quantiser.scale <= link::Quantiser::highestScale)) {
        throw Error("the scale of the quantiser is not a number above 0 and up to 1000000", "give one");
    }
    if (maxBlocks == 0 || maxBlocks > highestMaxBlocks) {
        throw Error("the number of blocks is not from 1 to 2^40", "give one that is");
    }
    if (points() > maxPoints) {
        throw Error(
            "there are " + std::to_string(points()) + " points, more than " + std::to_string(maxPoints),
            "make a range shorter or its step larger");
    }
}

}  // namespace quarzel::sweep
