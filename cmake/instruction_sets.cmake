# SPDX-License-Identifier: MIT
# The instruction sets that some files are compiled for, each with its flags and the 16-bit lanes of its widest vectors:
# the only place that names one for the compiler.
# Lanes go without the checks of stack and copies, which cost them a fifth of their speed: vectors that registers have no
# room for lie on the stack, and are loaded as copies.
set(quarzel_sets baseline)
set(quarzel_lanes_baseline 8)
set(quarzel_flags_baseline -fno-stack-protector -U_FORTIFY_SOURCE)
if(CMAKE_SYSTEM_PROCESSOR STREQUAL "x86_64")
  list(APPEND quarzel_sets sse41 avx2 avx512bw)
  set(quarzel_lanes_sse41 8)
  set(quarzel_flags_sse41 ${quarzel_flags_baseline} -msse4.1)
  set(quarzel_lanes_avx2 16)
  # Wider vectors than the stack's alignment: realigned, or those that registers have no room for straddle cache lines.
  set(quarzel_flags_avx2 ${quarzel_flags_baseline} -mavx2 -mstackrealign)
  set(quarzel_lanes_avx512bw 32)
  set(quarzel_flags_avx512bw ${quarzel_flags_baseline} -mavx512bw -mavx512vl -mavx512dq -mstackrealign)
endif()
