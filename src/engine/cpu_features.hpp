// SPDX-License-Identifier: MIT
#pragma once

/// Whether the processor offers SSE2.
bool hasSSE2();
