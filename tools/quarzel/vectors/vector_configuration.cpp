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
{tags}{link}
Blocks count from 0, and so do transport blocks, code blocks and transmissions where there are any.

A bench that writes its decisions with $writememh is checked by

    quarzel compare {first} simulated.hex
)text";

constexpr std::string_view tagsReadme =
    R"text(- tags.hex: for $readmemh; the tag that each block is given and that the core, of 8-bit tags, gives back

Run the blocks of a core in their order, on one core, and compare tags too: some of the faults that the set finds show in
nothing else.
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

Json coverJson(Cover cover) {
    return cover == Cover::nothing ? Json(false) : Json(cover == Cover::faults ? "faults" : "sizes");
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
    if (request.cover == Cover::faults) {
        return {{"cover", coverJson(request.cover)},
                {"units", request.units},
                {"algorithms", request.algorithms},
                {"command", commandOf(request)}};
    }
    if (request.capture) {
        return {{"capture", request.capture->file}, {"block_sizes", request.blockSizes},
                {"units", request.units},           {"algorithms", request.algorithms},
                {"iterations", request.iterations}, {"blocks", request.blocks},
                {"command", commandOf(request)}};
    }
    Json configuration = {
        {"seed", request.seed},
        {"cover", coverJson(request.cover)},
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
        request.capture                  ? "--capture " + shellWord(request.capture->file)
        : request.cover == Cover::faults ? "--cover"
        : request.cover == Cover::sizes  ? "--cover-sizes"
        : request.link                   ? linkText(*request.link)
                       : fmt::format("--block-size {} --stimulus {}", sizesText(request.blockSizes),
                                     fmt::join(stimuliJson(request).get<std::vector<std::string>>(), ","));
    const std::string command =
        fmt::format("quarzel vectors DIRECTORY {} --units {} --algorithm {}", what,
                    fmt::join(request.units, ","), fmt::join(request.algorithms, ","));
    if (request.cover == Cover::faults) {
        return command;
    }
    const std::string iterations = fmt::format("--iterations {}", fmt::join(request.iterations, ","));
    const std::string quantiser =
        fmt::format("--{} {}", isLlr(request) ? "llr" : "scale", request.quantiser.scale);
    if (request.capture) {
        return command + ' ' + iterations + (request.isScaled ? ' ' + quantiser : "");
    }
    return fmt::format("{} {} --blocks {} --ebn0 {} {} --seed {}", command, iterations, request.blocks,
                       request.ebN0.value(), quantiser, request.seed);
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
                       fmt::arg("tags", request.cover == Cover::faults ? tagsReadme : ""),
                       fmt::arg("first", cores.front().directory));
}

}  // namespace quarzel::tool
