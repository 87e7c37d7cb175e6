// SPDX-License-Identifier: MIT
#pragma once

#include <mex.h>

#include <functional>
#include <span>
#include <string_view>
#include <vector>

#include "common/host_core.hpp"

namespace quarzel::octave {

/// What the coding chain asks for besides its arguments.
struct LteHost {
    /// The core of some settings.
    std::function<bindings::HostCore&(const CoreSettings&)> core;
    bindings::HostCore::Interrupted interrupted;
};

/// A command of the coding chain, for the function of its name in inst/, which has given all its arguments a
/// class: bits uint8, soft values int16, symbols as a matrix of two rows.
/// @param results  receives what the command gives; they belong to the caller
/// @return         false when there is no such command, or not with so many arguments
/// @throws bindings::BindingError or std::invalid_argument for what does not fit
bool runLte(std::string_view command, std::span<const mxArray* const> arguments,
            std::vector<mxArray*>& results, const LteHost& host);

}  // namespace quarzel::octave
