// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>

#include "interface/state.hpp"

/// One block to be decoded, and the parts of its decode that all forms of the call share.
namespace quarzel {

/// A block in a form that all calls share.
struct BlockCall {
    const void* streams[3];         ///< systematic, parity 1, parity 2: the values of position 0
    std::ptrdiff_t positionStride;  ///< from a position to the next one, in values
    int valueType;                  ///< VARDEL_IP_QUARZEL_INT8, _INT16 or _INT32: bytes of a value
    int size;                       ///< positions
    int iterations;
    unsigned tag;
    unsigned char* dout;
    int allocated;                   ///< bytes at dout; a negative number counts as boundless
    std::ptrdiff_t iterationStride;  ///< bytes between the decisions of two iterations; 0: only the last
};

/// How a decode ended.
struct Outcome {
    int status;
    std::size_t bits = 0;  ///< decisions written, when the status is 0
};

/// The text for the first argument of a block that is wrong, or null.
const char* findFault(const BlockCall& call);

/// Write "ERROR:decoder:" and a text.
void decoderError(const Messages& messages, std::string_view text) noexcept;

/// The error of a wrong argument.
/// @return its status
int refuse(const Messages& messages, std::string_view text) noexcept;

/// The error of a call that an exception ended, because memory ran out for instance.
/// @return its status
int unhandledException(const Messages& messages) noexcept;

/// Warn of the first saturated value in the life of a state.
void reportSaturation(vardel_ip_quarzel_state& state, const BlockCall& call);

/// Whether this tag is the first truncated one in the life of a state.
bool truncates(const vardel_ip_quarzel_state& state, unsigned tag);

/// Warn of the first truncated tag in the life of a state.
void reportTruncation(vardel_ip_quarzel_state& state, unsigned tag);

/// A negative number of bytes counts as boundless: the comparison is unsigned.
constexpr bool hasRoom(const BlockCall& call, std::size_t bits) {
    return static_cast<std::size_t>(call.allocated) >= bits;
}

/// Information bits of a block, or 0 when it has no room for a tail.
constexpr unsigned blockSize(const BlockCall& call) {
    return call.size > 4 ? static_cast<unsigned>(call.size) - 4 : 0;
}

/// Decode a block without a fault, by lanes where they may.
Outcome decodeBlock(vardel_ip_quarzel_state& state, const BlockCall& call);

/// Decode a block of a source: every step of a call of simulate behind the checks of its records.
///
/// @param source  gives a block by its number, and takes what comes back:
///                `BlockCall block(int)`, `void finish(int, std::size_t bits, unsigned maskedTag)`
/// @return        the status
template <class Source>
int simulateBlock(vardel_ip_quarzel_state& state, const Source& source, int index) {
    const BlockCall call = source.block(index);
    if (const char* fault = findFault(call)) {
        return refuse(state.messages, fault);
    }
    const Outcome outcome = decodeBlock(state, call);
    if (outcome.status == 0) {
        source.finish(index, outcome.bits, call.tag & state.tag_mask);
        reportTruncation(state, call.tag);
    }
    return outcome.status;
}

/// The records of simulate and of its batch form.
class RecordSource {
  public:
    RecordSource(vardel_ip_quarzel_outputs* outputs, const vardel_ip_quarzel_inputs* inputs)
        : itsOutputs(outputs), itsInputs(inputs) {}

    BlockCall block(int index) const {
        const vardel_ip_quarzel_inputs& in = itsInputs[index];
        const vardel_ip_quarzel_outputs& out = itsOutputs[index];
        return {{in.rsc1_sys, in.rsc1_par, in.rsc2_par},
                1,
                VARDEL_IP_QUARZEL_INT32,
                in.din_size,
                in.iterations,
                in.tag,
                out.dout,
                out.dout_alloc_size,
                0};
    }

    void finish(int index, std::size_t bits, unsigned tag) const {
        itsOutputs[index].dout_size = static_cast<int>(bits);
        itsOutputs[index].tag = tag;
    }

  private:
    vardel_ip_quarzel_outputs* itsOutputs;
    const vardel_ip_quarzel_inputs* itsInputs;
};

}  // namespace quarzel
