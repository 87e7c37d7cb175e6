// SPDX-License-Identifier: MIT
#pragma once

#include <string_view>

#include "interface/soft_input.hpp"

/// The lines of the model interface. A line for which there is no memory is lost.
namespace quarzel {

/// "ERROR:decoder:" and the text, on the standard error stream.
void decoderError(std::string_view text) noexcept;

/// The error of a call that ended by an exception, such as a lack of memory.
/// @return its status
int unhandledException() noexcept;

/// The warning of the first saturated input, on the standard output stream.
void warnSaturation(const Saturation& saturation) noexcept;

/// The warning of the first truncated tag, on the standard output stream.
void warnTagTruncation(int tagWidth) noexcept;

}  // namespace quarzel
