// SPDX-License-Identifier: MIT
#include "sweeps/rebuild_report.hpp"

#include <fmt/format.h>

#include <nlohmann/json.hpp>

#include "report_text.hpp"

namespace quarzel::tool {

void printText(std::ostream& stream, const RebuildReport& report) {
    std::string text;
    reportLine(text, "result", report.result);
    reportLine(text, "point", fmt::format("{}, counted from 0: {}", report.point, setupText(report.setup)));
    reportLine(text, "block", fmt::format("{}, counted from 0, of seed {}", report.number, report.seed));
    if (report.setup.sending.transportBlock != 0) {
        reportLine(
            text, "code block",
            fmt::format("{} of 0 to {} (K = {})", report.codeBlock, report.codeBlocks - 1, report.blockSize));
    }
    reportLine(text, "bit errors",
               report.errors.blocks.empty()
                   ? "none"
                   : fmt::format("{} of {}, the first at bit {}", report.errors.bits, report.blockSize,
                                 report.errors.blocks.front().firstBit));
    stream << text;
}

void printJson(std::ostream& stream, const RebuildReport& report) {
    using Json = nlohmann::ordered_json;
    const auto& wrong = report.errors.blocks;
    const Json object = {{"result", report.result},
                         {"seed", report.seed},
                         {"point", report.point},
                         {"setup", setupText(report.setup)},
                         {"block", report.number},
                         {"code_block", report.codeBlock},
                         {"block_size", report.blockSize},
                         {"bit_errors", report.errors.bits},
                         {"first_bit", wrong.empty() ? Json() : Json(wrong.front().firstBit)}};
    // A file name need not be UTF-8; what is not becomes U+FFFD.
    stream << object.dump(-1, ' ', false, Json::error_handler_t::replace) << '\n';
}

}  // namespace quarzel::tool
