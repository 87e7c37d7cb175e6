// SPDX-License-Identifier: MIT
#include "lte_transport.hpp"

#include <algorithm>
#include <array>
#include <vector>

#include "encoding.hpp"

namespace quarzel::bindings {

namespace {

/// The code blocks of one size in some transport blocks.
class SizeGroup {
  public:
    /// @param K      their size
    /// @param count  how many each transport block has
    SizeGroup(std::uint32_t K, std::size_t count)
        : itsPositions(K + tailPositions), itsBits(count * K), itsCount(count) {}

    /// The values of all streams that come from a transport block.
    std::size_t streamsSize() const { return 3 * itsPositions * itsCount; }

    void add(const std::int8_t* streams) {
        itsStreams.insert(itsStreams.end(), streams, streams + streamsSize());
    }

    void decode(HostCore& core, int iterations, const HostCore::Interrupted& interrupted) {
        if (!itsStreams.empty()) {
            const auto blocks = softBlocks(std::span<const std::int8_t>(itsStreams), itsPositions);
            itsDecisions.resize(blocks.count * (itsPositions - tailPositions));
            requireDone(core.decode({blocks, iterations, itsDecisions}, interrupted));
        }
    }

    /// The decisions on the code blocks of the transport block that was added as number i.
    void appendDecisions(std::size_t i, std::vector<std::uint8_t>& to) const {
        const auto own = std::span(itsDecisions).subspan(i * itsBits, itsBits);
        to.insert(to.end(), own.begin(), own.end());
    }

  private:
    std::size_t itsPositions;
    std::size_t itsBits;  ///< of a transport block
    std::size_t itsCount;
    std::vector<std::int8_t> itsStreams;
    std::vector<std::uint8_t> itsDecisions;
};

/// Decode the transport blocks from `first` to before `end`.
void decodeSome(const link::TransportBlockCode& code, const link::Transmission& transmission,
                Rows<const std::int16_t> soft, HostCore& core, int iterations,
                const TransportResults& results, const HostCore::Interrupted& interrupted, std::size_t first,
                std::size_t end) {
    const link::Segmentation& cut = code.segmentation();
    std::array<SizeGroup, 2> groups = {SizeGroup(cut.Kminus, cut.Cminus), SizeGroup(cut.Kplus, cut.Cplus)};
    link::SoftBuffers sums;
    for (std::size_t i = first; i < end; ++i) {
        const auto buffer = results.buffers[i];
        sums.values.assign(buffer.begin(), buffer.end());
        const std::vector<std::int8_t> streams = code.combine(soft[i], transmission, sums);
        std::copy(sums.values.begin(), sums.values.end(), buffer.begin());
        groups[0].add(streams.data());
        groups[1].add(streams.data() + groups[0].streamsSize());
    }
    for (SizeGroup& group : groups) {
        group.decode(core, iterations, interrupted);
    }
    std::vector<std::uint8_t> decisions;
    for (std::size_t i = first; i < end; ++i) {
        decisions.clear();
        for (const SizeGroup& group : groups) {
            group.appendDecisions(i - first, decisions);
        }
        const link::TransportDecisions decided = code.decide(decisions);
        std::copy(decided.bits.begin(), decided.bits.end(), results.bits[i].begin());
        results.ok[i][0] = decided.ok ? 1 : 0;
    }
}

}  // namespace

void encodeTransportBlocks(const link::TransportBlockCode& code, const link::Transmission& transmission,
                           Rows<const std::uint8_t> bits, Rows<std::uint8_t> coded) {
    requireBits(bits.all());
    for (std::size_t i = 0; i < bits.count(); ++i) {
        code.encode(bits[i], transmission, coded[i]);
    }
}

void decodeTransportBlocks(const link::TransportBlockCode& code, const link::Transmission& transmission,
                           Rows<const std::int16_t> soft, HostCore& core, int iterations,
                           const TransportResults& results, const HostCore::Interrupted& interrupted) {
    checkIterations(iterations);
    // Enough for the lanes of any processor, and no more memory than that.
    constexpr std::size_t enoughBits = 1 << 20;
    const std::size_t group = enoughBits / code.segmentation().totalSize() + 1;
    for (std::size_t first = 0; first < soft.count(); first += group) {
        decodeSome(code, transmission, soft, core, iterations, results, interrupted, first,
                   std::min(first + group, soft.count()));
    }
}

}  // namespace quarzel::bindings
