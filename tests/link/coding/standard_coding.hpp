// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <vector>

/// 3GPP TS 36.212, sections 5.1.1 to 5.1.5, written down formula by formula and bit by bit, with nothing
/// shared with what is tested.
namespace quarzel::test::standard {

using Bits = std::vector<int>;

constexpr int null = -1;

/// The 188 sizes of table 5.1.3-3, ascending.
const std::vector<int>& blockSizes();

/// Section 5.1.1: the parity bits for a generator polynomial, which is given by its powers.
Bits parity(const Bits& a, const std::vector<int>& powers);
const std::vector<int>& powersOfCrc24A();
const std::vector<int>& powersOfCrc24B();
const std::vector<int>& powersOfCrc16();
const std::vector<int>& powersOfCrc8();

/// Section 5.1.2.
struct Sizes {
    int C, Kplus, Kminus, Cplus, Cminus, F;
};
Sizes sizes(int B);
std::vector<Bits> segments(const Bits& b);

/// The filler counts of block 0 that occur for up to 13 code blocks: entry i belongs to block size i.
const std::vector<std::vector<int>>& fillers();

/// Section 5.1.3.2.
using Streams = std::array<Bits, 3>;
Streams turboCode(const Bits& c);

/// Section 5.1.4.1.1, and the buffer w of section 5.1.4.1.2.
Bits subBlock(const Bits& d, int stream);
Bits circularBuffer(const Streams& d);

/// Section 5.1.4.1.2: the indices into w of the E bits that are sent.
std::vector<int> selection(const Bits& w, int D, int Ncb, int rv, int E);
int codedSize(int r, int C, int G, int layers, int Qm);

/// Sections 5.1.1 to 5.1.5 for one transport block; N_IR as large as can be.
Bits encode(const Bits& a, int G, int layers, int Qm, int rv);

}  // namespace quarzel::test::standard
