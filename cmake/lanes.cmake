# SPDX-License-Identifier: MIT
# The lanes for each instruction set. The files are optimised in every build: without inlining they are of no use.
# One source makes them all. The baseline has every check of the sanitizers; in the others the checks of each pointer,
# half of the time that they take to compile, would find nothing else.
set(QUARZEL_LANES_LEVEL -O3 CACHE STRING "How the lanes are optimised, in every build without sanitizers")
target_sources(quarzel_objects PRIVATE lanes/lanes.cpp)
set(checks "")
foreach(name IN LISTS quarzel_sets)
  set(file lanes/lanes_${name}.cpp)
  target_sources(quarzel_objects PRIVATE ${file})
  set_source_files_properties(${file} PROPERTIES
    COMPILE_OPTIONS "$<IF:$<BOOL:${QUARZEL_SANITIZE}>,-O1;${checks},${QUARZEL_LANES_LEVEL}>;${quarzel_flags_${name}}")
  set(checks -fno-sanitize=null -fno-sanitize=alignment)
endforeach()
