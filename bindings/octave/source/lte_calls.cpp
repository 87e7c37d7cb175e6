// SPDX-License-Identifier: MIT
#include "lte_calls.hpp"

#include <algorithm>
#include <array>
#include <complex>
#include <string>

#include "common/lte_coding.hpp"
#include "common/lte_modulation.hpp"
#include "common/lte_transport.hpp"
#include "decode_options.hpp"
#include "link/coding/coded_sizes.hpp"
#include "link/modulation/demodulation.hpp"
#include "link/size_table.hpp"
#include "mex_arrays.hpp"

namespace quarzel::octave {

using bindings::RateMatchingOptions;

namespace {

using Arguments = std::span<const mxArray* const>;
using Results = std::vector<mxArray*>;

unsigned numberIn(const mxArray* array, const char* name) {
    return static_cast<unsigned>(countIn(array, name));
}

/// (name of the check, bits) -> parity
void crc(Arguments in, Results& out, const LteHost&) {
    const link::Crc check = bindings::crcOf(textOf(in[0]));
    const auto bits = bitColumns(in[1]);
    const unsigned length = link::crcLength(check);
    out.push_back(makeColumns(length, bits.count(), mxUINT8_CLASS));
    bindings::findParity(check, bits, columnsIn<std::uint8_t>(out[0], length, bits.count()));
}

/// (bits) -> blocks below one another, their sizes, filler
void segment(Arguments in, Results& out, const LteHost&) {
    const auto bits = bitColumns(in[0]);
    const auto cut = link::segmentationOf(bits.size());
    out.push_back(makeColumns(cut.totalSize(), bits.count(), mxUINT8_CLASS));
    bindings::segment(cut, bits, columnsIn<std::uint8_t>(out[0], cut.totalSize(), bits.count()));
    out.push_back(makeColumns(cut.C, 1, mxDOUBLE_CLASS));
    const auto sizes = columnsIn<double>(out[1], cut.C, 1).all();
    for (std::size_t r = 0; r < cut.C; ++r) {
        sizes[r] = cut.size(r);
    }
    out.push_back(mxCreateDoubleScalar(static_cast<double>(cut.F)));
}

/// (blocks below one another, their sizes, B) -> bits, whether the CRC of each holds
void desegment(Arguments in, Results& out, const LteHost&) {
    const auto blocks = bitColumns(in[0]);
    const std::size_t B = countIn(in[2], "B");
    const auto cut = link::segmentationOf(B);
    const auto given = realColumns(in[1]).all();
    bindings::requireSizes(cut, std::vector<std::size_t>(given.begin(), given.end()));
    out.push_back(makeColumns(B, blocks.count(), mxUINT8_CLASS));
    out.push_back(makeColumns(cut.C, blocks.count(), mxUINT8_CLASS));
    bindings::desegment(cut, blocks, columnsIn<std::uint8_t>(out[0], B, blocks.count()),
                        columnsIn<std::uint8_t>(out[1], cut.C, blocks.count()));
}

/// (blocks, filler) -> streams
void turboEncode(Arguments in, Results& out, const LteHost&) {
    const auto blocks = bitColumns(in[0]);
    const std::size_t positions = blocks.size() + tailPositions;
    out.push_back(makePages(positions, blocks.count(), mxUINT8_CLASS));
    bindings::turboEncode(blocks, countIn(in[1], "filler"),
                          columnsIn<std::uint8_t>(out[0], 3 * positions, blocks.count()));
}

RateMatchingOptions rateMatchingOptions(const mxArray* rv, const mxArray* bufferSize, const mxArray* filler) {
    RateMatchingOptions options{numberIn(rv, "rv"), {}, countIn(filler, "filler")};
    if (mxGetNumberOfElements(bufferSize) != 0) {
        options.bufferSize = countIn(bufferSize, "buffer_size");
    }
    return options;
}

/// (streams, E, rv, buffer size, filler) -> coded bits
void rateMatch(Arguments in, Results& out, const LteHost&) {
    const auto streams = bitPages(in[0]);
    const std::size_t E = countIn(in[1], "E");
    out.push_back(makeColumns(E, streams.count(), mxUINT8_CLASS));
    bindings::rateMatch(rateMatchingOptions(in[2], in[3], in[4]), streams,
                        columnsIn<std::uint8_t>(out[0], E, streams.count()));
}

/// (soft values, K, rv, buffer size, filler, buffer, width) -> streams, buffer
void rateRecover(Arguments in, Results& out, const LteHost&) {
    const auto soft = softColumns(in[0]);
    const std::uint32_t K = link::checkedBlockSize(numberIn(in[1], "K"));
    const auto options = rateMatchingOptions(in[2], in[3], in[4]);
    const std::size_t size = options.bufferSize.value_or(link::wholeBufferSize(K));
    const auto given = softColumns(in[5]);
    const bool isGiven = given.size() != 0;
    if (isGiven && given.count() != soft.count()) {
        throw bindings::BindingError(bindings::Fault::value,
                                     "there are " + std::to_string(given.count()) + " buffers for " +
                                         std::to_string(soft.count()) + " blocks; give one a block");
    }
    const std::size_t positions = K + tailPositions;
    out.push_back(makePages(positions, soft.count(), mxINT8_CLASS));
    out.push_back(makeColumns(isGiven ? given.size() : size, soft.count(), mxINT16_CLASS));
    const auto sums = columnsIn<std::int16_t>(out[1], isGiven ? given.size() : size, soft.count());
    if (isGiven) {
        std::copy(given.all().begin(), given.all().end(), sums.all().begin());
    }
    bindings::rateRecover(options, soft, numberIn(in[6], "width"), sums,
                          columnsIn<std::int8_t>(out[0], 3 * positions, soft.count()));
}

/// (bits, scheme) -> symbols of all blocks, real parts above imaginary ones
void modulate(Arguments in, Results& out, const LteHost&) {
    const auto bits = bitColumns(in[0]);
    const auto modulation = link::modulationOf(textOf(in[1]));
    const std::size_t count = bindings::symbolsOf(modulation, bits.size()) * bits.count();
    out.push_back(makeColumns(2, count, mxDOUBLE_CLASS));
    bindings::modulate(modulation, bits.all(),
                       {static_cast<std::complex<double>*>(mxGetData(out[0])), count});
}

/// (symbols of all blocks as above, scheme, variances, method) -> ratios in one column
void demodulate(Arguments in, Results& out, const LteHost&) {
    const auto parts = realColumns(in[0]);
    const auto modulation = link::modulationOf(textOf(in[1]));
    const std::size_t ratios = parts.count() * link::bitsOfSymbol(modulation);
    out.push_back(makeColumns(ratios, 1, mxDOUBLE_CLASS));
    const auto* const first = static_cast<const std::complex<double>*>(mxGetData(in[0]));
    link::demodulate({first, parts.count()}, modulation, realColumns(in[2]).all(),
                     columnsIn<double>(out[0], ratios, 1).all(), link::demappingOf(textOf(in[3])));
}

link::Transmission transmissionOf(std::size_t G, Arguments in) {
    return {G, link::bitsOfSymbol(link::modulationOf(textOf(in[0]))), numberIn(in[1], "layers"),
            numberIn(in[2], "rv")};
}

/// (bits, G, scheme, layers, rv) -> coded bits
void encodeTransportBlock(Arguments in, Results& out, const LteHost&) {
    const auto bits = bitColumns(in[0]);
    const std::size_t G = countIn(in[1], "G");
    const link::TransportBlockCode code(bits.size());
    out.push_back(makeColumns(G, bits.count(), mxUINT8_CLASS));
    bindings::encodeTransportBlocks(code, transmissionOf(G, in.subspan(2)), bits,
                                    columnsIn<std::uint8_t>(out[0], G, bits.count()));
}

/// (soft values, A, scheme, layers, rv, iterations, units, algorithm, buffers) -> bits, ok, buffers
void decodeTransportBlock(Arguments in, Results& out, const LteHost& host) {
    const auto soft = softColumns(in[0]);
    const std::size_t A = countIn(in[1], "A");
    const link::TransportBlockCode code(A);
    const auto given = softColumns(in[8]);
    const bool isGiven = given.size() != 0;
    if (isGiven && (given.count() != soft.count() || given.size() != code.softValues())) {
        throw bindings::BindingError(bindings::Fault::value,
                                     "transport blocks of A = " + std::to_string(A) +
                                         " bits have soft buffers of " + std::to_string(code.softValues()) +
                                         " values, one in each of " + std::to_string(soft.count()) +
                                         " columns, not " + std::to_string(given.size()) + " x " +
                                         std::to_string(given.count()));
    }
    const CoreSettings settings{wholeNumber(in[6], "units"), algorithmIn(in[7]), 0};
    out.push_back(makeColumns(A, soft.count(), mxUINT8_CLASS));
    out.push_back(makeColumns(1, soft.count(), mxUINT8_CLASS));
    out.push_back(makeColumns(code.softValues(), soft.count(), mxINT16_CLASS));
    const bindings::TransportResults results{columnsIn<std::int16_t>(out[2], code.softValues(), soft.count()),
                                             columnsIn<std::uint8_t>(out[0], A, soft.count()),
                                             columnsIn<std::uint8_t>(out[1], 1, soft.count())};
    if (isGiven) {
        std::copy(given.all().begin(), given.all().end(), results.buffers.all().begin());
    }
    bindings::decodeTransportBlocks(code, transmissionOf(soft.size(), in.subspan(2)), soft,
                                    host.core(settings), wholeNumber(in[5], "iterations"), results,
                                    host.interrupted);
}

struct Command {
    std::string_view name;
    std::size_t arguments;
    void (*run)(Arguments, Results&, const LteHost&);
};

constexpr std::array<Command, 10> commands = {{{"crc", 2, crc},
                                               {"segment", 1, segment},
                                               {"desegment", 3, desegment},
                                               {"turbo_encode", 2, turboEncode},
                                               {"rate_match", 5, rateMatch},
                                               {"rate_recover", 7, rateRecover},
                                               {"modulate", 2, modulate},
                                               {"demodulate", 4, demodulate},
                                               {"encode_transport_block", 5, encodeTransportBlock},
                                               {"decode_transport_block", 9, decodeTransportBlock}}};

}  // namespace

bool runLte(std::string_view command, Arguments arguments, Results& results, const LteHost& host) {
    const auto found = std::find_if(commands.begin(), commands.end(),
                                    [&](const Command& one) { return one.name == command; });
    if (found == commands.end() || arguments.size() != found->arguments) {
        return false;
    }
    found->run(arguments, results, host);
    return true;
}

}  // namespace quarzel::octave
