// SPDX-License-Identifier: MIT
#ifndef QUARZEL_CODE_HPP
#define QUARZEL_CODE_HPP

#include <array>
#include <cstddef>
#include <cstdint>
#include <new>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "vardel_ip_quarzel.h"

/// The facts of the code and of a core, for C++: thin functions over vardel_ip_quarzel.h. All are pure.
namespace quarzel {

/// Positions of a stream behind the information bits: they hold the twelve tail values of a block.
inline constexpr std::size_t tailPositions = 4;

/// Names of the algorithm types, in their order.
inline constexpr std::array<std::string_view, 3> algorithmNames = {"max-log", "scaled-max-log", "max-star"};

using BlockSize = vardel_ip_quarzel_block_size;
using Layout = vardel_ip_quarzel_layout;
using Signal = vardel_ip_quarzel_signal;
using Branch = vardel_ip_quarzel_branch;

/// Encoder states of a constituent code.
inline constexpr unsigned encoderStates = 8;

namespace detail {

/// All that a numbered list of the C interface gives.
template <class Item, class Get>
std::vector<Item> listOf(Get get) {
    std::vector<Item> items;
    Item item{};
    while (get(static_cast<int>(items.size()), &item) == 0) {
        items.push_back(item);
    }
    return items;
}

}  // namespace detail

/// The 188 block sizes, in ascending order.
inline std::vector<BlockSize> blockSizes() {
    return detail::listOf<BlockSize>(vardel_ip_quarzel_get_block_size);
}

/// The block size of K information bits; none when there is no such size.
inline std::optional<BlockSize> findBlockSize(std::uint64_t K) {
    BlockSize size{};
    for (int index = 0; vardel_ip_quarzel_get_block_size(index, &size) == 0; ++index) {
        if (size.K == K) {
            return size;
        }
    }
    return std::nullopt;
}

/// The natural position that is read at each interleaved one.
/// @throws std::invalid_argument when there is no block size K
/// @throws std::bad_alloc when there is no memory
inline std::vector<unsigned> permutation(std::uint32_t K) {
    if (!findBlockSize(K)) {
        throw std::invalid_argument("there is no block size of " + std::to_string(K) + " bits");
    }
    std::vector<unsigned> table(K);
    if (vardel_ip_quarzel_get_permutation(K, table.data()) != 0) {
        throw std::bad_alloc();
    }
    return table;
}

/// The segments and windows that a core cuts a block into.
/// @throws std::invalid_argument when there is no such block size, or the units are not 2, 4 or 8
inline Layout layout(std::uint32_t K, std::uint32_t units) {
    Layout layout{};
    if (vardel_ip_quarzel_get_layout(K, units, &layout) != 0) {
        throw std::invalid_argument("there is no block size of " + std::to_string(K) +
                                    " bits, or no core of " + std::to_string(units) + " units");
    }
    return layout;
}

/// The signals of a pass, in the order of a trace's columns and of the members of vardel_ip_quarzel_pass.
inline std::vector<Signal> signals() {
    return detail::listOf<Signal>(vardel_ip_quarzel_get_signal);
}

/// The branch of the trellis that an information bit takes from an encoder state.
/// @throws std::invalid_argument when there is none
inline Branch branch(unsigned state, unsigned bit) {
    Branch branch{};
    if (vardel_ip_quarzel_get_branch(state, bit, &branch) != 0) {
        throw std::invalid_argument("there is no branch of bit " + std::to_string(bit) + " from state " +
                                    std::to_string(state));
    }
    return branch;
}

/// The corrections of the maxima of algorithm type 2, for the differences -2048 to 2047, all in units of 1/8.
/// @throws std::bad_alloc when there is no memory
inline std::array<unsigned char, 4096> corrections() {
    std::array<unsigned char, 4096> table{};
    if (vardel_ip_quarzel_get_corrections(table.data()) != 0) {
        throw std::bad_alloc();
    }
    return table;
}

/// The implementations that this machine can run, best first; the last one is "literal".
inline std::vector<std::string> implementations() {
    std::vector<std::string> names;
    while (const char* name = vardel_ip_quarzel_get_implementation_name(static_cast<int>(names.size()))) {
        names.emplace_back(name);
    }
    return names;
}

}  // namespace quarzel

#endif
