// SPDX-License-Identifier: MIT
#include "vectors/vector_plan.hpp"

#include "quarzel/code.hpp"

namespace quarzel::tool {

namespace {

constexpr std::size_t specialStimuli = stimulusNames.size() - 1;

/// The `index`-th stimulus that is not plain noise.
Stimulus special(std::size_t index) {
    return static_cast<Stimulus>(1 + index % specialStimuli);
}

/// Blocks of zeros are all the same: one will do.
std::size_t countOf(Stimulus stimulus, std::size_t blocks) {
    return stimulus == Stimulus::zero ? 1 : blocks;
}

void append(std::vector<PlannedBlock>& plan, std::uint32_t K, int iterations, Stimulus stimulus,
            std::size_t count) {
    for (std::uint32_t number = 0; number < count; ++number) {
        plan.push_back({K, iterations, stimulus, number});
    }
}

/// Whether a block size is the first or the last one with its number of thread segments.
bool isAtAnEnd(const std::vector<std::uint32_t>& sizes, std::size_t index, std::uint32_t units) {
    const auto segments = [&](std::size_t i) { return layout(sizes[i], units).segments; };
    return index == 0 || index + 1 == sizes.size() || segments(index) != segments(index - 1) ||
           segments(index) != segments(index + 1);
}

}  // namespace

std::vector<PlannedBlock> planBlocks(const VectorRequest& request, std::uint32_t units) {
    std::vector<PlannedBlock> plan;
    const std::vector<std::uint32_t>& sizes = request.blockSizes;
    if (request.cover != Cover::sizes) {
        for (const std::uint32_t K : sizes) {
            for (const int iterations : request.iterations) {
                for (const Stimulus stimulus : request.stimuli) {
                    append(plan, K, iterations, stimulus, countOf(stimulus, request.blocks));
                }
            }
        }
        return plan;
    }
    for (std::size_t i = 0; i < sizes.size(); ++i) {
        const int iterations = request.iterations[i % request.iterations.size()];
        append(plan, sizes[i], iterations, Stimulus::noise, request.blocks);
        const std::size_t count = isAtAnEnd(sizes, i, units) ? specialStimuli : 1;
        for (std::size_t j = 0; j < count; ++j) {
            append(plan, sizes[i], iterations, special(i + j), 1);
        }
    }
    return plan;
}

}  // namespace quarzel::tool
