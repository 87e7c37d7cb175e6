// SPDX-License-Identifier: MIT
#include "vectors/vector_configuration.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <nlohmann/json.hpp>

#include "quarzel/code.hpp"
#include "report_text.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;

constexpr std::string_view readme = R"text(# Test vectors of a turbo decoder core

Made by quarzel {version}:

    {command}

manifest.json tells the configuration, every block, what the blocks reach, and the SHA-256 of every file:

    jq -r '.files[] | "\(.sha256)  \(.name)"' manifest.json | sha256sum --check

Each core has a directory:

{cores}
- config.vh: UNITS, ALGORITHM, BLOCKS, SOFT_WORDS, DOUT_WORDS, MAX_K as localparams, to be included
- blocks.hex: for $readmemh; four 32-bit words a block: K, iterations, address of its first soft value, address of its
  first decision
- rsc1_sys.hex, rsc1_par.hex, rsc2_par.hex: for $readmemh; soft values, two's complement bytes, K + 4 a block; positive
  means bit 1, the unit is 1/8
- dout.hex: for $readmemh; the hard decisions that the core is to give, a bit a word, K a block
- npy/: the same blocks by K and iterations, for 'quarzel decode' and numpy
{link}
A bench that writes its decisions with $writememh is checked by

    quarzel compare {first} simulated.hex
)text";

constexpr std::string_view linkReadme = R"text(
The blocks come from a link. link/ has a memory for each of its stages; manifest.json tells under "stages" what each file
holds, what a word is and which section of the standard defines it:

- link/link.vh: sizes as localparams, to be included
- link/layout.hex: eight 32-bit words a code block: K, filler bits, coded bits, entries of the circular buffer, and the
  address of its first word in code_blocks.hex, streams.hex, coded.hex and buffer.hex within a block of the link
- link/rv.hex: the redundancy version of each transmission, 2 bits

Words are ordered by block, transmission and code block. A core decodes all code blocks after each transmission.
)text";

constexpr std::string_view crcReadme = R"text(
crc.hex of a core tells for each number of iterations, block and transmission whether the CRC of the transport block holds,
then those of its code blocks: 1 bit a word, 1 where it holds.
)text";

template <class Names, class Kind>
std::string_view nameIn(const Names& names, Kind kind) {
    return names.at(static_cast<std::size_t>(kind));
}

Json linkJson(const link::LinkSetup& setup) {
    return {{"block_size", setup.blockSize},
            {"transport_block", setup.transportBlock},
            {"coded_bits", setup.codedBits},
            {"redundancy_versions", setup.redundancyVersions},
            {"modulation", link::nameOf(setup.channel.modulation)},
            {"channel", nameIn(link::channelNames, setup.channel.fading)},
            {"demapping", nameIn(link::demappingNames, setup.channel.demapping)}};
}

/// The options that choose a link.
std::string linkText(const link::LinkSetup& setup) {
    return fmt::format("{} --coded-bits {} --modulation {} --channel {} --demapping {} --rv {}",
                       setup.transportBlock != 0 ? fmt::format("--transport-block {}", setup.transportBlock)
                                                 : fmt::format("--block-size {}", setup.blockSize),
                       setup.codedBits, link::nameOf(setup.channel.modulation),
                       nameIn(link::channelNames, setup.channel.fading),
                       nameIn(link::demappingNames, setup.channel.demapping),
                       fmt::join(setup.redundancyVersions, ","));
}

Json stimuliJson(const VectorRequest& request) {
    Json names = Json::array();
    for (const Stimulus stimulus : request.stimuli) {
        names.push_back(nameOf(stimulus));
    }
    return names;
}

bool isLlr(const VectorRequest& request) {
    return request.quantiser.kind == link::Quantiser::Kind::llr;
}

/// The block sizes as the option takes them.
std::string sizesText(const std::vector<std::uint32_t>& sizes) {
    return sizes.size() == blockSizes().size() ? "all" : fmt::format("{}", fmt::join(sizes, ","));
}

}  // namespace

Json configurationJson(const VectorRequest& request) {
    Json configuration = {
        {"seed", request.seed},
        {"cover", request.cover},
        {"block_sizes", request.blockSizes},
        {"units", request.units},
        {"algorithms", request.algorithms},
        {"iterations", request.iterations},
        {"stimuli", stimuliJson(request)},
        {"blocks", request.blocks},
        {"ebn0_db", request.ebN0.value()},
        {"quantiser", {{"kind", isLlr(request) ? "llr" : "scale"}, {"scale", request.quantiser.scale}}},
        {"command", commandOf(request)}};
    if (request.link) {
        configuration["link"] = linkJson(*request.link);
    }
    return configuration;
}

std::string commandOf(const VectorRequest& request) {
    const std::string what =
        request.cover  ? "--cover"
        : request.link ? linkText(*request.link)
                       : fmt::format("--block-size {} --stimulus {}", sizesText(request.blockSizes),
                                     fmt::join(stimuliJson(request).get<std::vector<std::string>>(), ","));
    return fmt::format(
        "quarzel vectors DIRECTORY {} --units {} --algorithm {} --iterations {} --blocks {} "
        "--ebn0 {} --{} {} --seed {}",
        what, fmt::join(request.units, ","), fmt::join(request.algorithms, ","),
        fmt::join(request.iterations, ","), request.blocks, request.ebN0.value(),
        isLlr(request) ? "llr" : "scale", request.quantiser.scale, request.seed);
}

std::string readmeText(const VectorRequest& request, const std::vector<VectorCore>& cores) {
    std::string list;
    for (const VectorCore& core : cores) {
        list += fmt::format("- {}/: {} units, algorithm {}, {}\n", core.directory, core.units, core.algorithm,
                            counted(core.blocks.size(), "block", "blocks"));
    }
    std::string link(request.link ? linkReadme : "");
    link += request.link && request.link->transportBlock != 0 ? crcReadme : "";
    return fmt::format(readme, fmt::arg("version", QUARZEL_VERSION), fmt::arg("command", commandOf(request)),
                       fmt::arg("cores", list), fmt::arg("link", link),
                       fmt::arg("first", cores.front().directory));
}

}  // namespace quarzel::tool
