// SPDX-License-Identifier: MIT
#pragma once

#include "vardel_ip_quarzel.h"

/// Callers may lay their arrays over each other. Then the order of reads and writes shows.
namespace quarzel {

/// Whether the decisions of a block overwrite its soft values.
bool overwritesInputs(const vardel_ip_quarzel_outputs& outputs, const vardel_ip_quarzel_inputs& inputs);

/// Whether a buffer for decisions shares bytes with anything else of these blocks, so that they have to be
/// decoded one after the other.
bool outputsOverlap(const vardel_ip_quarzel_outputs* outputs, const vardel_ip_quarzel_inputs* inputs,
                    int count);

}  // namespace quarzel
