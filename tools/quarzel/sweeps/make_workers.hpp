// SPDX-License-Identifier: MIT
#pragma once

#include <functional>
#include <memory>

#include "sweep/run.hpp"

namespace quarzel::tool {

/// Makes the workers of a sweep.
/// @param threads  of each process; 0: the usual number
using MakeWorkers = std::function<std::unique_ptr<sweep::Workers>(unsigned threads)>;

/// Workers that are threads of this process, usually one for each core.
std::unique_ptr<sweep::Workers> makeThreadWorkers(unsigned threads);

}  // namespace quarzel::tool
