// SPDX-License-Identifier: MIT
#include "interface/soft_input.hpp"

#include <cstdint>

namespace quarzel {

int valueAt(const BlockCall& call, std::size_t stream, int position) {
    const std::ptrdiff_t place = call.positionStride * position;
    switch (call.valueType) {
        case VARDEL_IP_QUARZEL_INT8:
            return static_cast<const std::int8_t*>(call.streams[stream])[place];
        case VARDEL_IP_QUARZEL_INT16:
            return static_cast<const std::int16_t*>(call.streams[stream])[place];
        default:
            return static_cast<const std::int32_t*>(call.streams[stream])[place];
    }
}

void toSoftValues(const BlockCall& call, const TNumberFormat& input, const TNumberFormat& state,
                  std::vector<short>& soft) {
    soft.reserve(3 * static_cast<std::size_t>(call.size));
    for (int position = 0; position < call.size; ++position) {
        for (std::size_t stream = 0; stream < 3; ++stream) {
            int saturated = 0;
            soft.push_back(toSoftValue(valueAt(call, stream, position), input, state, saturated));
        }
    }
}

std::optional<Saturation> findSaturation(const BlockCall& call, const TNumberFormat& input) {
    for (int position = 0; position < call.size; ++position) {
        for (std::size_t stream = 0; stream < 3; ++stream) {
            int saturated = 0;
            toSoftValue(valueAt(call, stream, position), input, input, saturated);
            if (saturated != 0) {
                return Saturation{position, stream, saturated > 0};
            }
        }
    }
    return std::nullopt;
}

}  // namespace quarzel
