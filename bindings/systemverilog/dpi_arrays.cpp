// SPDX-License-Identifier: MIT
// The decoding functions of quarzel_pkg that take whole arrays.
#include <svdpi.h>

#include <algorithm>
#include <array>
#include <string>
#include <vector>

#include "dpi_call.hpp"
#include "dpi_logic.hpp"

// A host that is no SystemVerilog simulator has no open arrays and need not have these functions.
#pragma weak svDimensions
#pragma weak svGetArrayPtr
#pragma weak svSize

namespace {

using namespace quarzel::bindings;
using namespace quarzel::dpi;

const std::int8_t* bytes(const void* values) {
    return static_cast<const std::int8_t*>(values);
}

/// Elements of an open array, which must have one dimension and lie as in C.
/// @return their number
std::size_t sizeOf(svOpenArrayHandle array, const char* name) {
    if (svDimensions == nullptr || svGetArrayPtr == nullptr || svSize == nullptr) {
        throw BindingError(Fault::type, "this program has no open arrays; use arrays of a fixed size");
    }
    if (svDimensions(array) != 1 || svGetArrayPtr(array) == nullptr) {
        throw BindingError(Fault::type, std::string(name) + " must be an unpacked array of one dimension");
    }
    return static_cast<std::size_t>(svSize(array, 1));
}

std::size_t countOf(int positions) {
    return static_cast<std::size_t>(std::max(positions, 0));
}

}  // namespace

extern "C" int quarzel_dpi_decode_fixed(void* handle, int positions, const char* systematic,
                                        const char* parity1, const char* parity2, int iterations,
                                        unsigned tag, svBit* bits) {
    return withCore(handle, [&](DpiCore& core) {
        const std::array streams = {bytes(systematic), bytes(parity1), bytes(parity2)};
        const int K = decodeStreams(core, streams, countOf(positions), iterations, tag);
        std::copy(core.bits.begin(), core.bits.end(), bits);
        return K;
    });
}

extern "C" int quarzel_dpi_decode_logic(void* handle, int positions, const svLogicVecVal* systematic,
                                        const svLogicVecVal* parity1, const svLogicVecVal* parity2,
                                        int iterations, unsigned tag, svBit* bits) {
    return withCore(handle, [&](DpiCore& core) {
        const std::size_t size = countOf(positions);
        blockSizeOf(size);
        const std::array values = {knownValues(systematic, size, "systematic"),
                                   knownValues(parity1, size, "parity1"),
                                   knownValues(parity2, size, "parity2")};
        const std::array streams = {values[0].data(), values[1].data(), values[2].data()};
        const int K = decodeStreams(core, streams, size, iterations, tag);
        std::copy(core.bits.begin(), core.bits.end(), bits);
        return K;
    });
}

extern "C" int quarzel_dpi_decode_open(void* handle, svOpenArrayHandle systematic, svOpenArrayHandle parity1,
                                       svOpenArrayHandle parity2, int iterations, unsigned tag,
                                       svOpenArrayHandle bits) {
    return withCore(handle, [&](DpiCore& core) {
        const std::size_t positions = sizeOf(systematic, "systematic");
        if (sizeOf(parity1, "parity1") != positions || sizeOf(parity2, "parity2") != positions) {
            throw BindingError(Fault::value, "the three streams must have the same size");
        }
        const std::uint32_t K = blockSizeOf(positions);
        if (sizeOf(bits, "bits") < K) {
            throw BindingError(Fault::value, "bits has no room for " + std::to_string(K) + " decisions");
        }
        const std::array streams = {bytes(svGetArrayPtr(systematic)), bytes(svGetArrayPtr(parity1)),
                                    bytes(svGetArrayPtr(parity2))};
        decodeStreams(core, streams, positions, iterations, tag);
        std::copy(core.bits.begin(), core.bits.end(), static_cast<svBit*>(svGetArrayPtr(bits)));
        return static_cast<int>(K);
    });
}
