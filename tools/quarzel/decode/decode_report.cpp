// SPDX-License-Identifier: MIT
#include "decode/decode_report.hpp"

#include <fmt/format.h>

#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "report_text.hpp"

namespace quarzel::tool {

namespace {

std::size_t bitsOf(const DecodeReport& report) {
    return report.blocks * report.blockSize;
}

/// Information bits over the time spent decoding, in Mbit/s.
double speedOf(const DecodeReport& report) {
    return static_cast<double>(bitsOf(report)) / report.seconds / 1e6;
}

double rate(std::size_t part, std::size_t whole) {
    return static_cast<double>(part) / static_cast<double>(whole);
}

/// "3, 17": the blocks that are wrong, all or the first of them.
std::string wrongText(const BitErrors& errors) {
    constexpr std::size_t mostBlocks = 10;
    std::vector<std::string> blocks;
    for (const WrongBlock& wrong : errors.blocks) {
        blocks.push_back(std::to_string(wrong.block));
    }
    return listText(blocks, mostBlocks);
}

nlohmann::ordered_json wrongJson(const BitErrors& errors) {
    nlohmann::ordered_json list = nlohmann::ordered_json::array();
    for (const WrongBlock& wrong : errors.blocks) {
        list.push_back({{"block", wrong.block}, {"bit_errors", wrong.bits}, {"first_bit", wrong.firstBit}});
    }
    return list;
}

}  // namespace

void printText(std::ostream& stream, const DecodeReport& report) {
    const CoreOptions& core = report.core;
    stream << fmt::format(
        "capture       {}\n"
        "block size    {} bits\n"
        "core          {} units, algorithm {}, {} iteration{}\n"
        "blocks        {}\n"
        "bits          {}\n"
        "time          {:.6f} s\n"
        "speed         {:.3f} Mbit/s\n",
        report.capture, report.blockSize, core.units, core.algorithm, core.iterations,
        core.iterations == 1 ? "" : "s", report.blocks, bitsOf(report), report.seconds, speedOf(report));
    if (report.errors) {
        stream << fmt::format(
            "bit errors    {} (BER {:.2e})\n"
            "block errors  {} (BLER {:.2e})\n",
            report.errors->bits, rate(report.errors->bits, bitsOf(report)), report.errors->blocks.size(),
            rate(report.errors->blocks.size(), report.blocks));
        if (!report.errors->blocks.empty()) {
            stream << fmt::format("wrong blocks  {}, counted from 0\n", wrongText(*report.errors));
        }
    }
}

void printJson(std::ostream& stream, const DecodeReport& report) {
    nlohmann::ordered_json object = {
        {"capture", report.capture},
        {"block_size", report.blockSize},
        {"units", report.core.units},
        {"algorithm", report.core.algorithm},
        {"iterations", report.core.iterations},
        {"implementation", report.core.implementation},
        {"blocks", report.blocks},
        {"bits", bitsOf(report)},
        {"seconds", report.seconds},
        {"mbit_per_s", speedOf(report)},
    };
    if (report.errors) {
        object["bit_errors"] = report.errors->bits;
        object["block_errors"] = report.errors->blocks.size();
        object["bit_error_rate"] = rate(report.errors->bits, bitsOf(report));
        object["block_error_rate"] = rate(report.errors->blocks.size(), report.blocks);
        object["wrong_blocks"] = wrongJson(*report.errors);
    }
    // A file name need not be UTF-8; what is not becomes U+FFFD.
    stream << object.dump(-1, ' ', false, nlohmann::ordered_json::error_handler_t::replace) << '\n';
}

}  // namespace quarzel::tool
