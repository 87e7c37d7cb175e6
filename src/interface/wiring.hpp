// SPDX-License-Identifier: MIT
#pragma once

/// What the generics of a core mean for its components.
namespace quarzel {

/// Property strings of the number formats.
inline constexpr const char* stateFormatProperties = "Fix_12_3";
inline constexpr const char* branchFormatProperties = "Fix_8_3";
inline constexpr const char* inputFormatProperties = "Fix_8_3";

/// Points of the correction table of algorithm type 2, as in the property string of its engine.
inline constexpr unsigned correctionPoints = 16;

/// Property string of the engine of an algorithm type.
constexpr const char* engineProperties(int algorithm) {
    return algorithm == 2 ? "MOD#:16" : "MOD";
}

/// Factor for the extrinsic values of an algorithm type.
constexpr double extrinsicScale(int algorithm) {
    return algorithm == 1 ? 0.75 : 1.0;
}

}  // namespace quarzel
