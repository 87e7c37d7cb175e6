// SPDX-License-Identifier: MIT
#include "decode/decode_traced.hpp"

#include <fmt/format.h>

#include <iostream>
#include <string_view>

#include "decode/decode_together.hpp"
#include "decode/progress.hpp"
#include "trace/trace_file.hpp"

namespace quarzel::tool {

PackedBits decodeTraced(const Capture& capture, const CoreOptions& options, std::size_t firstTraced,
                        TraceFile& trace, Progress& progress) {
    Core core = coreOf(options);
    core.onMessage([&trace](MessageKind kind, std::string_view text) {
        if (kind == MessageKind::trace) {
            trace.writeLine(text);
        } else {
            std::cerr << fmt::format("{}\n", text);
        }
    });
    PackedBits decisions(capture.blocks(), capture.blockSize);
    for (std::size_t block = 0; block < capture.blocks(); ++block) {
        if (block == firstTraced) {
            trace.start(core);
        }
        decodePart(core, capture, block, 1, options.iterations, decisions);
        progress.update(block + 1);
    }
    trace.finish();
    return decisions;
}

}  // namespace quarzel::tool
