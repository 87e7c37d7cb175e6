// SPDX-License-Identifier: MIT
#include "vectors/captured_stimulus.hpp"

#include <algorithm>
#include <limits>

namespace quarzel::tool {

CoreStimulus capturedBlocks(const VectorRequest& request) {
    const std::shared_ptr<const Capture> capture = request.capture;
    CoreStimulus stimulus;
    for (const int iterations : request.iterations) {
        for (std::size_t block = 0; block < capture->blocks(); ++block) {
            stimulus.blocks.push_back({capture->blockSize, iterations, capturedStimulus, "", 0});
        }
    }
    stimulus.soft = [capture](std::size_t i) {
        const std::size_t values = 3 * capture->positions();
        const auto first =
            capture->soft.begin() + static_cast<std::ptrdiff_t>(i % capture->blocks() * values);
        std::vector<std::int8_t> soft(values);
        std::transform(first, first + static_cast<std::ptrdiff_t>(values), soft.begin(),
                       [](std::int32_t value) {
                           using Limits = std::numeric_limits<std::int8_t>;
                           return static_cast<std::int8_t>(
                               std::clamp<std::int32_t>(value, Limits::min(), Limits::max()));
                       });
        return soft;
    };
    return stimulus;
}

}  // namespace quarzel::tool
