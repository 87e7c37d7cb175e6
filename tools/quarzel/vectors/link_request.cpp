// SPDX-License-Identifier: MIT
#include "vectors/link_request.hpp"

#include <stdexcept>

#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

/// The only value of a list, or what stands for it when there is none.
template <class Value>
Value onlyOf(const std::vector<Value>& values, const Value& standard, const char* option) {
    if (values.size() > 1) {
        throw ToolError(ExitCode::usage, option, "names several values; the link of a set has one",
                        "make a set for each");
    }
    return values.empty() ? standard : values.front();
}

}  // namespace

link::LinkSetup linkSetupOf(const LinkOptions& options, const std::vector<std::uint32_t>& blockSizes,
                            const link::Quantiser& quantiser) {
    link::LinkSetup setup;
    setup.transportBlock = onlyOf(options.transportBlocks, 0U, "--transport-block");
    const bool isTransport = setup.transportBlock != 0;
    if (isTransport && !blockSizes.empty()) {
        throw ToolError(ExitCode::usage, "--block-size",
                        "does not go with --transport-block, which is cut into code blocks", "leave it out");
    }
    setup.blockSize = isTransport ? 0 : onlyOf(blockSizes, 40U, "--block-size");
    setup.redundancyVersions = redundancyVersionsOf(options);
    setup.channel = {link::modulationOf(onlyOf(options.modulations, {}, "--modulation")),
                     link::fadingOf(onlyOf(options.channels, {}, "--channel")),
                     link::demappingOf(onlyOf(options.demappings, {}, "--demapping")), quantiser};
    const std::uint32_t codedBits = onlyOf(options.codedBits, 0U, "--coded-bits");
    const double rate = onlyOf(options.codeRates, 0.0, "--code-rate");
    if (codedBits != 0 && rate != 0) {
        throw ToolError(ExitCode::usage, "--code-rate", "does not go with --coded-bits",
                        "leave one of them out");
    }
    if (isTransport && codedBits == 0 && rate == 0) {
        throw ToolError(ExitCode::usage, "--transport-block", "does not tell how many bits are sent",
                        "give --coded-bits or --code-rate");
    }
    setup.codedBits = rate == 0 ? codedBits
                                : link::codedBitsOfRate(isTransport ? setup.transportBlock : setup.blockSize,
                                                        rate, link::bitsOfSymbol(setup.channel.modulation));
    try {
        return link::CodedLink(setup).setup();
    } catch (const std::invalid_argument& error) {
        throw ToolError(ExitCode::usage, rate == 0 ? "--coded-bits" : "--code-rate", error.what(),
                        "choose a size that fits");
    }
}

}  // namespace quarzel::tool
