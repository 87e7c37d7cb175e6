// SPDX-License-Identifier: MIT
// The facts of the code: block sizes, permutation, segments and windows, signals of a pass, trellis,
// corrections.
#include <algorithm>
#include <array>
#include <iterator>
#include <memory>
#include <vector>

#include "decoder/decoder_3gpu.hpp"
#include "decoder/segments.hpp"
#include "engine/dump_columns.hpp"
#include "engine/engine_mod_base.hpp"
#include "engine/trellis.hpp"
#include "fixed/number_format.hpp"
#include "interface/wiring.hpp"
#include "interleaver/interleaver_3gpplte.hpp"
#include "interleaver/lte_params.hpp"
#include "vardel_ip_quarzel.h"

namespace {

/// The descriptions of the columns that decoder/trace_columns.hpp names.
constexpr std::array<vardel_ip_quarzel_signal, 6> signals = {{
    {"int", "intrinsic value", 1, 0},
    {"a", "forward metric", 8, 0},
    {"b", "backward metric", 8, 0},
    {"g", "branch metric", 4, 4},
    {"llr", "log-likelihood ratio", 1, 0},
    {"ext", "extrinsic value", 1, 0},
}};

}  // namespace

const char* vardel_ip_quarzel_version() {
    return VARDEL_IP_QUARZEL_VERSION;
}

int vardel_ip_quarzel_get_block_size(int index, vardel_ip_quarzel_block_size* size) {
    if (index < 0 || static_cast<std::size_t>(index) >= lteParams.size()) {
        return 1;
    }
    const LteParams& row = lteParams[static_cast<std::size_t>(index)];
    *size = {row.K, row.f1, row.f2};
    return 0;
}

int vardel_ip_quarzel_get_permutation(unsigned int K, unsigned int* permutation) {
    const TInterleaver3GPPLTE interleaver;
    try {
        std::vector<std::uint32_t> table;
        if (!interleaver.valid(K) || !interleaver.calcInterleaver(table, K)) {
            return 1;
        }
        std::copy(table.begin(), table.end(), permutation);
        return 0;
    } catch (...) {
        return 1;
    }
}

int vardel_ip_quarzel_get_layout(unsigned int K, unsigned int units, vardel_ip_quarzel_layout* layout) {
    if (!TInterleaver3GPPLTE().valid(K) || (units != 2 && units != 4 && units != 8)) {
        return 1;
    }
    *layout = {};
    layout->threads = units * TDecoder3GPU::defaultThreads;
    layout->segments = quarzel::threadSegments(K, layout->threads);
    layout->segment_steps = K / layout->segments;
    for (unsigned rest = layout->segment_steps; rest != 0;) {
        const unsigned length = quarzel::windowLength(rest);
        layout->window_steps[layout->windows++] = length;
        rest -= length;
    }
    return 0;
}

int vardel_ip_quarzel_get_signal(int index, vardel_ip_quarzel_signal* signal) {
    if (index < 0 || static_cast<std::size_t>(index) >= signals.size()) {
        return 1;
    }
    *signal = signals[static_cast<std::size_t>(index)];
    return 0;
}

int vardel_ip_quarzel_get_branch(unsigned int state, unsigned int bit, vardel_ip_quarzel_branch* branch) {
    if (state >= quarzel::trellis::states || bit > 1) {
        return 1;
    }
    const auto& links = quarzel::trellis::links;
    const std::size_t target = bit == 1 ? links.plusTarget[state] : links.minusTarget[state];
    const auto column = std::ranges::find(quarzel::branchColumns, links.branchMetric[state]);
    *branch = {state, static_cast<unsigned>(target),
               4 + static_cast<unsigned>(column - std::begin(quarzel::branchColumns))};
    return 0;
}

int vardel_ip_quarzel_get_corrections(unsigned char* corrections) {
    try {
        const std::unique_ptr<TNumberFormat> format(TNumberFormat::create(quarzel::stateFormatProperties));
        const std::vector<unsigned char> table =
            TCalculationEngineModBase::createLUT(quarzel::correctionPoints, format.get());
        for (std::size_t word = 0; word < table.size(); word += std::size_t{1} << format->shift) {
            *corrections++ = static_cast<unsigned char>(table[word] >> format->shift);
        }
        return 0;
    } catch (...) {
        return 1;
    }
}
