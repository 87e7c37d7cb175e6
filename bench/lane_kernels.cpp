// SPDX-License-Identifier: MIT
// Compiled once for each instruction set, with QUARZEL_KERNELS its name and QUARZEL_KERNELS_LANES its lanes.
#include "bench/lane_kernels.hpp"

#include "lanes/lane_loops.hpp"

namespace quarzel::bench {

namespace {

using lanes::LaneGroup;
constexpr std::size_t width = QUARZEL_KERNELS_LANES;

/// Call `visit(window, column)` for every window and every vector of a row.
template <class Decoder, class Visit>
void forEachWindow(const LaneGroup& group, Visit visit) {
    std::size_t bottom = 0;
    for (std::size_t w = 0; w < group.windows; ++w) {
        const typename Decoder::Window window{bottom, group.windowLength[w], w == 0, w + 1 == group.windows};
        for (std::size_t column = 0; column < group.slices; ++column) {
            visit(window, column);
        }
        bottom += window.length;
    }
}

void readInputs(const LaneGroup& group) {
    lanes::readInputs(group);
    lanes::setStarts<true>(group);
}

template <int Algorithm>
void forward(const LaneGroup& group) {
    using Decoder = lanes::GroupDecoder<width, false, Algorithm>;
    const Decoder decoder(group);
    forEachWindow<Decoder>(group, [&](const auto& window, std::size_t column) {
        decoder.template forward<1>(window, column, false);
    });
}

/// Its results are written, so that they are not optimised away; the last window's starts serve all.
template <int Algorithm>
void backward(const LaneGroup& group) {
    using Decoder = lanes::GroupDecoder<width, false, Algorithm>;
    const Decoder decoder(group);
    forEachWindow<Decoder>(group, [&](const auto& window, std::size_t column) {
        const auto end =
            decoder.template backward<1>(window, column, group.betaStart[1] + column * width, false);
        std::memcpy(group.boundary + column * width, &end, sizeof(std::int16_t));
    });
}

}  // namespace

extern const LaneKernels QUARZEL_KERNELS;
const LaneKernels QUARZEL_KERNELS = {width,
                                     readInputs,
                                     {forward<0>, forward<1>, forward<2>},
                                     {backward<0>, backward<1>, backward<2>},
                                     lanes::writeDecisions};

}  // namespace quarzel::bench
