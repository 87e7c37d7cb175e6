// SPDX-License-Identifier: MIT
#pragma once

#include <memory>
#include <vector>

#include "vardel_ip_quarzel.h"

namespace quarzel::test {

/// The default generics.
inline vardel_ip_quarzel_generics defaultGenerics() {
    vardel_ip_quarzel_generics generics;
    return *vardel_ip_quarzel_get_default_generics(&generics);
}

inline vardel_ip_quarzel_generics genericsOf(int units, int tagWidth, int algorithm) {
    vardel_ip_quarzel_generics generics = defaultGenerics();
    generics.C_NUM_PU = units;
    generics.C_TAG_WIDTH = tagWidth;
    generics.C_ALGORITHM_TYPE = algorithm;
    return generics;
}

struct DestroyState {
    void operator()(vardel_ip_quarzel_state* state) const { vardel_ip_quarzel_destroy_state(state); }
};
using State = std::unique_ptr<vardel_ip_quarzel_state, DestroyState>;

inline State makeState(const vardel_ip_quarzel_generics& generics = defaultGenerics()) {
    return State(vardel_ip_quarzel_create_state(generics));
}

/// A code block in the caller's form.
struct Block {
    std::vector<int> systematic;
    std::vector<int> parity1;
    std::vector<int> parity2;
    int iterations = 2;
    unsigned tag = 0;

    /// din_size values in each stream, all the same.
    explicit Block(std::size_t size, int value = -8)
        : systematic(size, value), parity1(size, value), parity2(size, value) {}

    Block(std::vector<int> sys, std::vector<int> par1, std::vector<int> par2, int iterations_, unsigned tag_)
        : systematic(std::move(sys)),
          parity1(std::move(par1)),
          parity2(std::move(par2)),
          iterations(iterations_),
          tag(tag_) {}

    vardel_ip_quarzel_inputs inputs() const {
        return {systematic.data(), parity1.data(),
                parity2.data(),    static_cast<int>(systematic.size()),
                iterations,        tag};
    }
};

/// What a call of simulate gave back; what it left untouched keeps these values.
struct Result {
    int status = -1;
    std::vector<unsigned char> bits = std::vector<unsigned char>(6144, 0xEE);
    vardel_ip_quarzel_outputs outputs{nullptr, 6144, -77, 0xDEADBEEF};
};

inline Result simulate(vardel_ip_quarzel_state* state, const vardel_ip_quarzel_inputs& inputs,
                       int allocated = 6144) {
    Result result;
    result.outputs.dout = result.bits.data();
    result.outputs.dout_alloc_size = allocated;
    result.status = vardel_ip_quarzel_bitacc_simulate(state, &result.outputs, inputs);
    return result;
}

}  // namespace quarzel::test
