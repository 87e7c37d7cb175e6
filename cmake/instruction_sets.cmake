# SPDX-License-Identifier: MIT
# The instruction sets that some files are compiled for, each with its flags and the 16-bit lanes of its widest vectors:
# the only place that names one for the compiler.
set(quarzel_sets baseline)
set(quarzel_lanes_baseline 8)
set(quarzel_flags_baseline)
if(CMAKE_SYSTEM_PROCESSOR STREQUAL "x86_64")
  list(APPEND quarzel_sets sse41 avx2 avx512bw)
  set(quarzel_lanes_sse41 8)
  set(quarzel_flags_sse41 -msse4.1)
  set(quarzel_lanes_avx2 16)
  # Wider vectors than the stack's alignment: realigned, or those that registers have no room for straddle cache lines.
  set(quarzel_flags_avx2 -mavx2 -mstackrealign)
  set(quarzel_lanes_avx512bw 32)
  set(quarzel_flags_avx512bw -mavx512bw -mavx512vl -mavx512dq -mstackrealign)
endif()
