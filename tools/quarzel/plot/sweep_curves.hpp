// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "link/channel_thresholds.hpp"
#include "sweep/point_state.hpp"

namespace quarzel::tool {

struct MeasuredPoint {
    double ebN0;              ///< in dB
    sweep::PointState state;  ///< its counts; after every iteration or the last one alone
};

/// A curve of a stored sweep and what it was measured with.
struct SweepCurve {
    std::string file;
    bool isTransportBlock;
    std::uint32_t blockSize;  ///< K, or A of transport blocks
    int units;
    int algorithm;
    int iterations;
    link::Quantiser quantiser;
    std::string sending;  ///< for people: "2048 coded bits, qpsk"; empty for the default
    std::uint64_t seed;
    double bitsPerSymbol;  ///< information bits that a symbol of the channel carries: Es/N0 over Eb/N0
    std::vector<MeasuredPoint> points;
};

/// Read the curves of a sweep's result file.
/// @throws ToolError when it cannot be read or is not a whole, unaltered result
std::vector<SweepCurve> readSweepCurves(const std::string& file);

}  // namespace quarzel::tool
