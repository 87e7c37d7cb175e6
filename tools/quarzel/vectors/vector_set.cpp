// SPDX-License-Identifier: MIT
#include "vectors/vector_set.hpp"

#include <fmt/format.h>

#include <memory>
#include <nlohmann/json.hpp>
#include <optional>

#include "tool_error.hpp"
#include "vectors/core_files.hpp"
#include "vectors/link_vectors.hpp"
#include "vectors/stimulus_source.hpp"
#include "vectors/vector_configuration.hpp"
#include "vectors/vector_coverage.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;

/// The blocks that a request without a link plans.
CoreStimulus plannedStimulus(const VectorRequest& request, std::uint32_t units) {
    std::vector<PlannedBlock> plan = planBlocks(request, units);
    CoreStimulus stimulus;
    for (const PlannedBlock& planned : plan) {
        stimulus.blocks.push_back({planned.blockSize, planned.iterations, nameOf(planned.stimulus), "", 0});
    }
    stimulus.soft = [plan = std::move(plan), source = std::make_shared<const StimulusSource>(request),
                     units](std::size_t i) { return source->make(plan[i], units); };
    return stimulus;
}

VectorCoverage coverageOf(const VectorCore& core, const std::vector<StimulusAndResponse>& blocks,
                          bool isLink) {
    VectorCoverage coverage(static_cast<std::uint32_t>(core.units));
    for (std::size_t i = 0; i < blocks.size(); ++i) {
        const VectorBlock& block = core.blocks[i];
        coverage.add(block.blockSize, block.iterations, isLink ? "link" : block.stimulus, blocks[i].soft,
                     blocks[i].decisions);
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
    VectorContent content;
    Json coverages = Json::object();
    VectorSetSummary summary;
    std::optional<LinkVectors> link;
    if (request.link) {
        link.emplace(request, threads);
        link->writeStages(output, content);
    }
    std::vector<CoreStimulus> stimuli;
    std::size_t total = 0;
    for (const int units : request.units) {
        stimuli.push_back(link ? link->stimulus()
                               : plannedStimulus(request, static_cast<std::uint32_t>(units)));
        total += stimuli.back().blocks.size() * request.algorithms.size();
    }
    for (std::size_t i = 0; i < stimuli.size(); ++i) {
        const int units = request.units[i];
        for (const int algorithm : request.algorithms) {
            VectorCore core{fmt::format("u{}_a{}", units, algorithm), units, algorithm, stimuli[i].blocks};
            const std::vector<StimulusAndResponse> blocks =
                makeBlocks(stimuli[i], units, algorithm, threads,
                           [&](std::size_t done) { progress(summary.blocks + done, total); });
            const std::vector<VectorFile> files = writeCore(output, core, blocks);
            content.files.insert(content.files.end(), files.begin(), files.end());
            if (link) {
                link->writeDecided(output, core, blocks, content);
            }
            const VectorCoverage coverage = coverageOf(core, blocks, link.has_value());
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
