// SPDX-License-Identifier: MIT
#pragma once

#include <vector>

#include "vectors/link_stages.hpp"
#include "vectors/manifest.hpp"
#include "vectors/output_directory.hpp"
#include "vectors/vector_blocks.hpp"
#include "vectors/vector_plan.hpp"

namespace quarzel::tool {

/// The part of a vector set that a link makes: blocks at all stages, what a core is given of them, and which
/// CRCs hold in what it decides.
class LinkVectors {
  public:
    /// @param request  with a link
    /// @param threads  how many threads make the stages; they are the same
    LinkVectors(const VectorRequest& request, unsigned threads);

    /// What a core is given: for each number of iterations every block, after each transmission, code block
    /// after code block. It must not outlive this object.
    CoreStimulus stimulus() const;

    /// Write the stages before a core.
    /// @param content  receives the files and what they hold
    /// @throws ToolError when one cannot be written
    void writeStages(OutputDirectory& directory, VectorContent& content) const;

    /// Write which CRCs hold in the decisions of a core; nothing for code blocks alone. And tell what the
    /// memories of the core hold.
    /// @param blocks   as decoded, in the order of `stimulus`
    /// @param content  receives the file and what all files hold
    /// @throws ToolError when it cannot be written
    void writeDecided(OutputDirectory& directory, const VectorCore& core,
                      const std::vector<StimulusAndResponse>& blocks, VectorContent& content) const;

  private:
    std::string crcText(const VectorCore& core, const std::vector<StimulusAndResponse>& blocks) const;

    link::CodedLink itsLink;
    std::vector<int> itsIterations;
    std::vector<LinkStages> itsBlocks;
};

}  // namespace quarzel::tool
