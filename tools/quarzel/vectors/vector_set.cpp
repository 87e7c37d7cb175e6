// SPDX-License-Identifier: MIT
#include "vectors/vector_set.hpp"

#include <fmt/format.h>

#include <memory>
#include <nlohmann/json.hpp>
#include <optional>

#include "tool_error.hpp"
#include "vectors/captured_stimulus.hpp"
#include "vectors/core_files.hpp"
#include "vectors/covering_blocks.hpp"
#include "vectors/link_vectors.hpp"
#include "vectors/stimulus_source.hpp"
#include "vectors/vector_configuration.hpp"
#include "vectors/vector_coverage.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;

/// The blocks that find the faults of a core.
CoreStimulus coveringStimulus(int units, int algorithm) {
    CoreStimulus stimulus;
    std::vector<CoveringBlock> blocks = coveringBlocks(units, algorithm);
    for (const CoveringBlock& block : blocks) {
        const PlannedBlock& planned = block.planned;
        stimulus.blocks.push_back(
            {planned.blockSize, planned.iterations, nameOf(planned.stimulus), "", 0, block.tag});
    }
    stimulus.soft = [blocks = std::move(blocks), units](std::size_t i) {
        return softValuesOf(blocks[i], units);
    };
    return stimulus;
}

/// The blocks that any other request without a link plans.
CoreStimulus plannedStimulus(const VectorRequest& request, int coreUnits) {
    const auto units = static_cast<std::uint32_t>(coreUnits);
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

/// What the blocks of a core reach, for the manifest.
Json coverageJson(const VectorCoverage& coverage, const VectorCore& core, Cover cover) {
    Json json = coverage.toJson();
    if (cover == Cover::faults) {
        const CoveringScore score = coveringScore(core.units, core.algorithm);
        json["faults"] = {
            {"catalogue", {{"found", score.found}, {"of", score.of}, {"equivalent", score.equivalent}}},
            {"held_out", {{"found", score.heldOutFound}, {"of", score.heldOutOf}}}};
    }
    return json;
}

void requireComplete(const VectorCoverage& coverage, const VectorCore& core) {
    const std::vector<std::string> missing = coverage.missing();
    if (!missing.empty()) {
        throw ToolError(
            ExitCode::usage, "--cover-sizes",
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
        for (const int algorithm : request.algorithms) {
            stimuli.push_back(link                             ? link->stimulus()
                              : request.capture                ? capturedBlocks(request)
                              : request.cover == Cover::faults ? coveringStimulus(units, algorithm)
                                                               : plannedStimulus(request, units));
            total += stimuli.back().blocks.size();
        }
    }
    std::size_t next = 0;
    for (const int units : request.units) {
        for (const int algorithm : request.algorithms) {
            const CoreStimulus& stimulus = stimuli[next++];
            VectorCore core{fmt::format("u{}_a{}", units, algorithm), units, algorithm, stimulus.blocks};
            const std::vector<StimulusAndResponse> blocks =
                makeBlocks(stimulus, units, algorithm, threads,
                           [&](std::size_t done) { progress(summary.blocks + done, total); });
            const std::vector<VectorFile> files = writeCore(output, core, blocks);
            content.files.insert(content.files.end(), files.begin(), files.end());
            if (link) {
                link->writeDecided(output, core, blocks, content);
            }
            const VectorCoverage coverage = coverageOf(core, blocks, link.has_value());
            if (request.cover == Cover::sizes) {
                requireComplete(coverage, core);
            }
            coverages[core.directory] = coverageJson(coverage, core, request.cover);
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
