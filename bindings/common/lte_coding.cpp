// SPDX-License-Identifier: MIT
#include "lte_coding.hpp"

#include <algorithm>
#include <array>
#include <string>
#include <vector>

#include "encoding.hpp"
#include "host_core.hpp"
#include "link/choice.hpp"
#include "link/coding/rate_matching.hpp"
#include "link/coding/rate_recovery.hpp"
#include "link/coding/turbo_encoding.hpp"
#include "link/size_table.hpp"

namespace quarzel::bindings {

namespace {

link::RateMatching tableOf(std::uint32_t K, const RateMatchingOptions& options) {
    return link::RateMatching(K, options.filler, options.bufferSize);
}

std::string textOf(const link::Segmentation& segmentation) {
    const auto blocks = [](std::size_t count, std::uint32_t K) {
        return std::to_string(count) + " of " + std::to_string(K) + " bits";
    };
    const std::string plus = blocks(segmentation.Cplus, segmentation.Kplus);
    return segmentation.Cminus == 0 ? plus
                                    : blocks(segmentation.Cminus, segmentation.Kminus) + ", then " + plus;
}

}  // namespace

link::Crc crcOf(std::string_view name) {
    constexpr std::array<std::string_view, 4> names = {"crc24a", "crc24b", "crc16", "crc8"};
    return static_cast<link::Crc>(link::placeOf(names, name, "check"));
}

void findParity(link::Crc crc, Rows<const std::uint8_t> bits, Rows<std::uint8_t> parity) {
    requireBits(bits.all());
    for (std::size_t i = 0; i < bits.count(); ++i) {
        link::writeCrc(crc, bits[i], parity[i]);
    }
}

void segment(const link::Segmentation& segmentation, Rows<const std::uint8_t> bits,
             Rows<std::uint8_t> blocks) {
    requireBits(bits.all());
    for (std::size_t i = 0; i < bits.count(); ++i) {
        link::segment(segmentation, bits[i], blocks[i]);
    }
}

void requireSizes(const link::Segmentation& segmentation, std::span<const std::size_t> sizes) {
    bool fits = sizes.size() == segmentation.C;
    for (std::size_t r = 0; fits && r < sizes.size(); ++r) {
        fits = sizes[r] == segmentation.size(r);
    }
    if (!fits) {
        std::string given;
        for (const std::size_t size : sizes) {
            given.append(given.empty() ? "" : ", ").append(std::to_string(size));
        }
        throw BindingError(Fault::value, "B = " + std::to_string(segmentation.B) + " bits are cut into " +
                                             std::to_string(segmentation.C) + " code blocks, " +
                                             textOf(segmentation) + "; these have " +
                                             (given.empty() ? "none" : given));
    }
}

void desegment(const link::Segmentation& segmentation, Rows<const std::uint8_t> blocks,
               Rows<std::uint8_t> bits, Rows<std::uint8_t> holds) {
    for (std::size_t i = 0; i < blocks.count(); ++i) {
        requireBits(blocks[i].subspan(segmentation.F));
        const std::vector<bool> result = link::desegment(segmentation, blocks[i], bits[i]);
        std::copy(result.begin(), result.end(), holds[i].begin());
    }
}

void turboEncode(Rows<const std::uint8_t> blocks, std::size_t filler, Rows<std::uint8_t> streams) {
    const link::Encoder encoder(link::checkedBlockSize(static_cast<std::uint32_t>(blocks.size())));
    link::requireFiller(filler, blocks.size());
    for (std::size_t i = 0; i < blocks.count(); ++i) {
        requireBits(blocks[i].subspan(filler));
        link::turboEncode(encoder, blocks[i], filler, streams[i]);
    }
}

void rateMatch(const RateMatchingOptions& options, Rows<const std::uint8_t> streams,
               Rows<std::uint8_t> coded) {
    const link::RateMatching table = tableOf(blockSizeOf(streams.size() / 3), options);
    link::requireCodedBits(coded.size());
    for (std::size_t i = 0; i < streams.count(); ++i) {
        link::rateMatch(table, options.rv, streams[i], coded[i]);
    }
    const auto sent = coded.all();
    if (std::any_of(sent.begin(), sent.end(), [](std::uint8_t bit) { return bit > 1; })) {
        throw BindingError(
            Fault::value,
            "a code bit that is sent is not 0 or 1; give filler = F where the block has filler bits");
    }
}

void rateRecover(const RateMatchingOptions& options, Rows<const std::int16_t> soft, unsigned width,
                 const std::optional<Rows<std::int16_t>>& buffers, Rows<std::int8_t> streams) {
    const link::RateMatching table = tableOf(blockSizeOf(streams.size() / 3), options);
    link::requireCodedBits(soft.size());
    std::vector<std::int16_t> sums(table.codeBits());
    for (std::size_t i = 0; i < soft.count(); ++i) {
        if (buffers) {
            link::readEntries(table, (*buffers)[i], sums);
        } else {
            std::fill(sums.begin(), sums.end(), std::int16_t{0});
        }
        link::rateRecover(table, options.rv, soft[i], sums, width);
        link::readStreams(table, sums, streams[i]);
        if (buffers) {
            link::writeEntries(table, sums, (*buffers)[i]);
        }
    }
}

}  // namespace quarzel::bindings
