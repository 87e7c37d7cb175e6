// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <map>
#include <nlohmann/json_fwd.hpp>
#include <set>
#include <string>
#include <vector>

namespace quarzel::tool {

/// What the blocks of a core reach, found from the values themselves.
class VectorCoverage {
  public:
    explicit VectorCoverage(std::uint32_t units) : itsUnits(units) {}

    /// Count a block.
    /// @param soft       3 (K + 4) soft values
    /// @param decisions  K bits
    void add(std::uint32_t K, int iterations, const std::string& stimulus,
             const std::vector<std::int8_t>& soft, const std::vector<unsigned char>& decisions);

    nlohmann::ordered_json toJson() const;

    /// What no block reaches of: every block size, every window shape, corrections in the first, a middle and
    /// the last segment, and both ends of the range in every stream. Empty when nothing is missing.
    std::vector<std::string> missing() const;

  private:
    void countCorrections(std::uint32_t K, const std::vector<std::int8_t>& soft,
                          const std::vector<unsigned char>& decisions);

    /// How often the values of a stream are special.
    struct Stream {
        std::size_t low = 0;   ///< -128
        std::size_t zero = 0;  ///< 0
        std::size_t high = 0;  ///< 127
    };

    std::uint32_t itsUnits;
    std::set<std::uint32_t> itsSizes;
    std::set<std::vector<std::uint32_t>> itsShapes;
    std::map<int, std::size_t> itsIterations;
    std::map<std::string, std::size_t> itsStimuli;
    std::array<Stream, 3> itsStreams;
    std::size_t itsSingle = 0;  ///< corrections in blocks of one segment
    std::size_t itsFirst = 0;   ///< corrections in the first of several segments
    std::size_t itsMiddle = 0;
    std::size_t itsLast = 0;
    std::array<std::size_t, 2> itsDecisions{};
};

}  // namespace quarzel::tool
