// SPDX-License-Identifier: MIT
#include "interface/messages.hpp"

#include <string>

#include "fixed/text_output.hpp"

namespace quarzel {

void decoderError(std::string_view text) {
    errorLine("ERROR:decoder:" + std::string(text));
}

void warnSaturation(const Saturation& saturation) {
    static constexpr const char* streams[] = {"RSC1 systematic", "RSC1 parity", "RSC2 parity"};
    outputLine("WARNING:decoder:" + std::string(streams[saturation.stream]) + " value in position " +
               std::to_string(saturation.position) +
               (saturation.positive ? " saturated positively" : " saturated negatively") +
               ", further saturation will not be reported");
}

void warnTagTruncation(int tagWidth) {
    outputLine("WARNING:decoder:Input block tag has been truncated to " + std::to_string(tagWidth) +
               " bits, further truncation will not be reported");
}

}  // namespace quarzel
