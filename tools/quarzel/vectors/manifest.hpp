// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <nlohmann/json_fwd.hpp>
#include <optional>
#include <string>
#include <vector>

namespace quarzel::tool {

/// The name of the manifest in the directory of a vector set.
constexpr const char* manifestName = "manifest.json";

/// A code block of a vector set.
struct VectorBlock {
    std::uint32_t blockSize;  ///< K
    int iterations;
    std::string stimulus;              ///< what its soft values are
    std::string capture;               ///< the npy file, in the directory of the core, that holds them too
    std::size_t row;                   ///< and where in it, from 0
    std::optional<unsigned> tag = {};  ///< what the core gets and gives back; for people, not read back
};

/// The blocks for one core, which lie in a directory of their own.
struct VectorCore {
    std::string directory;
    int units;
    int algorithm;
    std::vector<VectorBlock> blocks;
};

/// A file of a vector set.
struct VectorFile {
    std::string name;  ///< from the directory of the set on
    std::size_t bytes;
    std::string sha256;
};

/// What a file of a vector set holds of a link.
struct VectorStage {
    std::string file;
    std::string holds;
    std::string word;    ///< what a word of the memory is
    std::string clause;  ///< of the standard that defines it
};

/// What there is in a vector set.
struct VectorContent {
    std::vector<VectorCore> cores;
    std::vector<VectorFile> files;
    std::vector<VectorStage> stages;  ///< of a link, for people; not read back
};

/// The text of a manifest: JSON with a line for each core, block and file.
/// @param configuration  what the set was made from
/// @param coverage       what its blocks reach
std::string manifestText(const nlohmann::ordered_json& configuration, const nlohmann::ordered_json& coverage,
                         const VectorContent& content);

/// Read the content that the text of a manifest tells.
/// @param file  its name, for error messages
/// @throws ToolError when it is of another version or not well-formed
VectorContent contentOf(const std::string& text, const std::string& file);

/// Read the content that the manifest of a set tells.
/// @param directory  of the set
/// @throws ToolError when there is none, or it is of another version or not well-formed
VectorContent readManifest(const std::string& directory);

/// The bytes of a file of a set, which must be as the manifest says.
/// @param directory  of the set
/// @param name       of the file, from there on
/// @throws ToolError when it cannot be read or is another one
std::string readUnaltered(const std::string& directory, const std::string& name,
                          const VectorContent& content);

}  // namespace quarzel::tool
