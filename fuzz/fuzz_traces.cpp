// SPDX-License-Identifier: MIT
// Traces in every form that trace-diff reads.
#include <array>
#include <optional>

#include "input_bytes.hpp"
#include "reading.hpp"
#include "trace/trace_block_reader.hpp"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    using namespace quarzel;
    using tool::TraceUnits;
    fuzz::InputBytes bytes(data, size);
    constexpr std::array<std::optional<TraceUnits>, 3> units = {std::nullopt, TraceUnits::raw,
                                                                TraceUnits::real};
    const auto chosen = units.at(static_cast<std::size_t>(bytes.takeFrom(0, 2)));
    fuzz::readText(bytes.rest(), [&](std::istream& stream) {
        tool::TraceBlockReader reader(tool::makeTraceReader(stream, "trace", chosen));
        while (reader.next()) {
        }
    });
    return 0;
}
