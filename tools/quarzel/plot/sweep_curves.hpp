// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace quarzel::tool {

/// An error rate and the interval that holds the true one with a probability of 95 %.
struct MeasuredRate {
    double rate;
    double low;
    double high;
};

struct MeasuredPoint {
    double ebN0;  ///< in dB
    MeasuredRate ber;
    MeasuredRate bler;
    std::vector<double> berAfter;   ///< after each iteration; empty when only the last one was counted
    std::vector<double> blerAfter;  ///< likewise
};

/// A curve of a stored sweep and what it was measured with.
struct SweepCurve {
    std::string file;
    std::uint32_t blockSize;  ///< K
    int units;
    int algorithm;
    int iterations;
    std::string quantiser;  ///< for people: "LLR x 8"
    std::uint64_t seed;
    std::vector<MeasuredPoint> points;
};

/// Read the curves of a sweep's result file.
/// @throws ToolError when it cannot be read or is not a whole, unaltered result
std::vector<SweepCurve> readSweepCurves(const std::string& file);

}  // namespace quarzel::tool
