// SPDX-License-Identifier: MIT
// CSV of error rates from elsewhere.
#include "input_bytes.hpp"
#include "plot/reference_rows.hpp"
#include "reading.hpp"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    using namespace quarzel;
    fuzz::readText(fuzz::InputBytes(data, size).rest(),
                   [](std::istream& stream) { tool::readReferenceRows(stream, "curves.csv"); });
    return 0;
}
