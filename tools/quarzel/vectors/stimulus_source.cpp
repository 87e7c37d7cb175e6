// SPDX-License-Identifier: MIT
#include "vectors/stimulus_source.hpp"

#include <algorithm>
#include <cstddef>
#include <limits>

#include "link/encoder.hpp"
#include "quarzel/code.hpp"

namespace quarzel::tool {

namespace {

constexpr std::int8_t lowest = std::numeric_limits<std::int8_t>::min();
constexpr std::int8_t highest = std::numeric_limits<std::int8_t>::max();
constexpr std::int8_t one = 8;  ///< 1.0
/// Every stimulus has random numbers of its own. Those of noise, the first one, are the sweep's.
constexpr unsigned stimulusShift = 40;

/// A stream of bits as soft values: `high` for 1, `low` for 0.
std::vector<std::int8_t> softOf(const std::vector<std::uint8_t>& bits, std::int8_t low, std::int8_t high) {
    std::vector<std::int8_t> soft(bits.size());
    std::transform(bits.begin(), bits.end(), soft.begin(),
                   [=](std::uint8_t bit) { return bit != 0 ? high : low; });
    return soft;
}

std::vector<std::uint8_t> codeWord(const link::RandomSource& source) {
    std::vector<std::uint8_t> bits(source.blockSize());
    source.informationBits(bits.data());
    const link::Encoder encoder(source.blockSize());
    std::vector<std::uint8_t> streams(3 * encoder.positions());
    encoder.encode(bits.data(), streams.data());
    return streams;
}

std::vector<std::uint8_t> randomBits(const link::RandomSource& source, std::size_t count) {
    constexpr std::size_t bitsPerGroup = 32 * link::wordsPerGroup;
    const std::size_t groups = (count + bitsPerGroup - 1) / bitsPerGroup;
    std::vector<std::uint32_t> words(groups * link::wordsPerGroup);
    source.words(link::Purpose::noise, 0, groups, words.data());
    std::vector<std::uint8_t> bits(count);
    for (std::size_t i = 0; i < count; ++i) {
        bits[i] = words[i / 32] >> i % 32 & 1U;
    }
    return bits;
}

std::vector<std::int8_t> overChannel(const link::QuantisedChannel& channel, const link::RandomSource& source,
                                     const std::vector<std::uint8_t>& codeBits) {
    std::vector<std::int8_t> soft(codeBits.size());
    channel.transmit(source, codeBits.data(), 0, codeBits.size(), soft.data());
    return soft;
}

/// Positions of every stream, from `first` to below `last`.
struct Range {
    std::size_t first;
    std::size_t last;
};

/// Take the values of a range from another block.
void replace(std::vector<std::int8_t>& soft, const Range& range, const std::vector<std::int8_t>& other) {
    const std::size_t positions = soft.size() / 3;
    for (std::size_t stream = 0; stream < 3; ++stream) {
        const auto at = static_cast<std::ptrdiff_t>(stream * positions + range.first);
        std::copy_n(other.begin() + at, range.last - range.first, soft.begin() + at);
    }
}

}  // namespace

StimulusSource::StimulusSource(const VectorRequest& request)
    : itsSeed(request.seed), itsEbN0(request.ebN0), itsChannel(request.quantiser, request.ebN0) {}

std::vector<std::int8_t> StimulusSource::make(const PlannedBlock& block, std::uint32_t units) const {
    const std::size_t positions = block.blockSize + tailPositions;
    const link::RandomSource source(
        {itsSeed, block.blockSize, itsEbN0,
         static_cast<std::uint64_t>(block.stimulus) << stimulusShift | block.number});
    const auto withNoiseIn = [&](const Range& range) {
        const std::vector<std::uint8_t> codeBits = codeWord(source);
        std::vector<std::int8_t> soft = softOf(codeBits, -one, one);
        replace(soft, range, overChannel(itsChannel, source, codeBits));
        return soft;
    };
    const std::size_t steps = layout(block.blockSize, units).segment_steps;
    switch (block.stimulus) {
        case Stimulus::noise:
            return overChannel(itsChannel, source, codeWord(source));
        case Stimulus::zero:
            break;
        case Stimulus::fullScale:
            return softOf(codeWord(source), lowest, highest);
        case Stimulus::ties:
            return softOf(randomBits(source, 3 * positions), -one, one);
        case Stimulus::saturating:
            return softOf(randomBits(source, 3 * positions), lowest, highest);
        case Stimulus::firstSegment:
            return withNoiseIn({0, steps});
        case Stimulus::lastSegment:
            return withNoiseIn({block.blockSize - steps, positions});
    }
    return std::vector<std::int8_t>(3 * positions);
}

}  // namespace quarzel::tool
