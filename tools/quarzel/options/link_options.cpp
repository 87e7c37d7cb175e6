// SPDX-License-Identifier: MIT
#include "options/link_options.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <algorithm>
#include <string_view>

#include "link/chain/coded_link.hpp"
#include "options/choices.hpp"
#include "options/list_option.hpp"
#include "options/text_items.hpp"
#include "options/whole_number.hpp"

namespace quarzel::tool {

namespace {

constexpr std::uint64_t mostCodedBits = std::uint64_t{1} << 24;

template <class Names>
CLI::Validator oneOf(const Names& names) {
    const std::vector<std::string> all(names.begin(), names.end());
    return withChoices({[all](std::string& text) {
                            return std::find(all.begin(), all.end(), text) != all.end()
                                       ? std::string()
                                       : fmt::format("'{}' is not {}", text, fmt::join(all, ", "));
                        },
                        ""},
                       all);
}

CLI::Validator numberTo(std::uint64_t most) {
    return wholeNumber([most](std::uint64_t n) { return n >= 1 && n <= most; },
                       fmt::format("a number from 1 to {}", most));
}

bool readRate(const std::string& text, double& rate) {
    const std::vector<std::string_view> parts = itemsOf(text, '/');
    double divisor = 1;
    const bool isNumber =
        CLI::detail::lexical_cast(std::string(parts[0]), rate) &&
        (parts.size() == 1 ||
         (parts.size() == 2 && CLI::detail::lexical_cast(std::string(parts[1]), divisor) && divisor > 0));
    rate /= divisor;
    return isNumber;
}

}  // namespace

CLI::Validator codeRateCheck() {
    return {[](std::string& text) {
                double rate = 0;
                if (!readRate(text, rate) || !(rate > 0 && rate <= 1)) {
                    return fmt::format("'{}' is not a code rate above 0 and up to 1, as 0.5 or 1/2", text);
                }
                text = fmt::format("{}", rate);
                return std::string();
            },
            ""};
}

void addLinkOptions(CLI::App& command, LinkOptions& options) {
    addListOption(command, "--coded-bits", options.codedBits,
                  "Coded bits of a transmission: E of a code block, G of\na transport block (default: each "
                  "code bit once)",
                  "LIST", numberTo(mostCodedBits));
    addListOption(command, "--code-rate", options.codeRates,
                  "The same as information bits for each coded bit, as\n0.5 or 1/2; taken to whole symbols",
                  "LIST", codeRateCheck());
    addListOption(command, "--modulation", options.modulations,
                  "bpsk, qpsk, 16qam, 64qam or 256qam (default bpsk)", "LIST", oneOf(link::modulationNames));
    addListOption(command, "--channel", options.channels,
                  "awgn, rayleigh (each symbol fades by itself) or\nrayleigh-block (each transmission does) "
                  "(default awgn)",
                  "LIST", oneOf(link::channelNames));
    addListOption(command, "--demapping", options.demappings,
                  "Log-likelihood ratios of symbols: maxlog or exact\n(default maxlog)", "LIST",
                  oneOf(link::demappingNames));
    addListOption(command, "--transport-block", options.transportBlocks,
                  "A: transport blocks of A bits with CRCs, cut into code\nblocks, instead of --block-size",
                  "LIST", numberTo(link::CodedLink::maxTransportBlock));
    const auto read = [&options](const std::vector<std::string>& lists) {
        for (const std::string& list : lists) {
            for (const std::string_view version : itemsOf(list, ',')) {
                options.redundancyVersions.push_back(static_cast<unsigned>(*readWholeNumber(version)));
            }
        }
    };
    command
        .add_option_function<std::vector<std::string>>(
            "--rv", read,
            "Redundancy version of each transmission, in turn\n(default 0, with --harq 0,2,3,1)")
        ->type_name("LIST")
        ->allow_extra_args(false)
        ->transform(eachItem(wholeNumber([](std::uint64_t n) { return n <= 3; }, "0, 1, 2 or 3")));
    command
        .add_option("--harq", options.transmissions,
                    "Send a block up to N times until it is right, soft\nvalues added up (default: as often "
                    "as --rv tells)")
        ->type_name("N")
        ->transform(numberTo(link::CodedLink::maxTransmissions));
}

std::vector<unsigned> redundancyVersionsOf(const LinkOptions& options) {
    std::vector<unsigned> turn = options.redundancyVersions;
    if (turn.empty()) {
        turn = {0, 2, 3, 1};
        turn.resize(options.transmissions > 1 ? turn.size() : 1);
    }
    std::vector<unsigned> versions;
    const std::size_t count = options.transmissions == 0 ? turn.size() : options.transmissions;
    for (std::size_t i = 0; i < count; ++i) {
        versions.push_back(turn[i % turn.size()]);
    }
    return versions;
}

}  // namespace quarzel::tool
