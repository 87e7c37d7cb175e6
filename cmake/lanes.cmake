# SPDX-License-Identifier: MIT
# The lane road for each instruction set: the only place that names one for the compiler. The files are optimised in
# every build: without inlining they are of no use.
function(quarzel_lane_file name)
  set(file engine/lanes/lanes_${name}.cpp)
  target_sources(quarzel_objects PRIVATE ${file})
  set_source_files_properties(${file} PROPERTIES
    COMPILE_OPTIONS "$<IF:$<BOOL:${QUARZEL_SANITIZE}>,-O1,-O3>;${ARGN}")
endfunction()

target_sources(quarzel_objects PRIVATE engine/lanes/lanes.cpp)
quarzel_lane_file(baseline)
if(CMAKE_SYSTEM_PROCESSOR STREQUAL "x86_64")
  quarzel_lane_file(sse41 -msse4.1)
  quarzel_lane_file(avx2 -mavx2)
  quarzel_lane_file(avx512bw -mavx512bw -mavx512vl -mavx512dq)
endif()
