// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <string>

/// The memories of a core in a vector set; each has a file NAME.hex. The streams are named as in the C
/// header.
namespace quarzel::tool {

constexpr std::array<const char*, 3> softMemories = {"rsc1_sys", "rsc1_par", "rsc2_par"};
constexpr const char* decisionMemory = "dout";
constexpr const char* blockMemory = "blocks";
constexpr const char* tagMemory = "tags";
constexpr const char* crcMemory = "crc";

inline std::string memoryFile(const std::string& memory) {
    return memory + ".hex";
}

}  // namespace quarzel::tool
