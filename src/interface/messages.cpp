// SPDX-License-Identifier: MIT
#include "interface/messages.hpp"

#include <string>

#include "fixed/text_output.hpp"

namespace quarzel {

namespace {

/// Write the line that `text` makes. Where there is no memory for it, it is lost: a message must not end a
/// call.
template <class Text>
void write(void (*line)(std::string_view), Text text) noexcept {
    try {
        line(text());
    } catch (...) {
        return;
    }
}

}  // namespace

void decoderError(std::string_view text) noexcept {
    write(errorLine, [text] { return "ERROR:decoder:" + std::string(text); });
}

int unhandledException() noexcept {
    decoderError("Unhandled exception has occurred");
    return 99;
}

void warnSaturation(const Saturation& saturation) noexcept {
    static constexpr const char* streams[] = {"RSC1 systematic", "RSC1 parity", "RSC2 parity"};
    write(outputLine, [&saturation] {
        return "WARNING:decoder:" + std::string(streams[saturation.stream]) + " value in position " +
               std::to_string(saturation.position) +
               (saturation.positive ? " saturated positively" : " saturated negatively") +
               ", further saturation will not be reported";
    });
}

void warnTagTruncation(int tagWidth) noexcept {
    write(outputLine, [tagWidth] {
        return "WARNING:decoder:Input block tag has been truncated to " + std::to_string(tagWidth) +
               " bits, further truncation will not be reported";
    });
}

}  // namespace quarzel
