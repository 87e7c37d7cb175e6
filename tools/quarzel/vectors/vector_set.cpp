// SPDX-License-Identifier: MIT
#include "vectors/vector_set.hpp"

#include <fmt/format.h>

#include <nlohmann/json.hpp>

#include "tool_error.hpp"
#include "vectors/core_files.hpp"
#include "vectors/vector_configuration.hpp"
#include "vectors/vector_coverage.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;

std::size_t blocksOf(const VectorRequest& request) {
    std::size_t blocks = 0;
    for (const int units : request.units) {
        blocks += planBlocks(request, static_cast<std::uint32_t>(units)).size() * request.algorithms.size();
    }
    return blocks;
}

VectorCoverage coverageOf(const VectorCore& core, const std::vector<StimulusAndResponse>& blocks) {
    VectorCoverage coverage(static_cast<std::uint32_t>(core.units));
    for (std::size_t i = 0; i < blocks.size(); ++i) {
        const VectorBlock& block = core.blocks[i];
        coverage.add(block.blockSize, block.iterations, block.stimulus, blocks[i].soft, blocks[i].decisions);
    }
    return coverage;
}

void requireComplete(const VectorCoverage& coverage, const VectorCore& core) {
    const std::vector<std::string> missing = coverage.missing();
    if (!missing.empty()) {
        throw ToolError(
            ExitCode::usage, "--cover",
            fmt::format("the blocks for core {} do not reach {}", core.directory, fmt::join(missing, ", ")),
            "choose a smaller --ebn0 or more --blocks");
    }
}

}  // namespace

VectorSetSummary makeVectorSet(const VectorRequest& request, const std::string& directory, bool isReplaced,
                               unsigned threads, const VectorProgress& progress) {
    OutputDirectory output(directory, isReplaced);
    const StimulusSource source(request);
    VectorContent content;
    Json coverages = Json::object();
    VectorSetSummary summary;
    const std::size_t total = blocksOf(request);
    for (const int units : request.units) {
        const std::vector<PlannedBlock> plan = planBlocks(request, static_cast<std::uint32_t>(units));
        for (const int algorithm : request.algorithms) {
            VectorCore core{fmt::format("u{}_a{}", units, algorithm), units, algorithm, {}};
            const std::vector<StimulusAndResponse> blocks =
                makeBlocks(plan, source, units, algorithm, threads,
                           [&](std::size_t done) { progress(summary.blocks + done, total); });
            const std::vector<VectorFile> files = writeCore(output, core, plan, blocks);
            content.files.insert(content.files.end(), files.begin(), files.end());
            const VectorCoverage coverage = coverageOf(core, blocks);
            if (request.cover) {
                requireComplete(coverage, core);
            }
            coverages[core.directory] = coverage.toJson();
            summary.blocks += blocks.size();
            for (const VectorBlock& block : core.blocks) {
                summary.bits += block.blockSize;
            }
            content.cores.push_back(std::move(core));
        }
    }
    content.files.push_back(output.write("README.md", readmeText(request, content.cores)));
    content.files.push_back(
        output.write(manifestName, manifestText(configurationJson(request), coverages, content)));
    output.finish();
    summary.cores = content.cores.size();
    summary.files = content.files.size();
    for (const VectorFile& file : content.files) {
        summary.bytes += file.bytes;
    }
    return summary;
}

}  // namespace quarzel::tool
