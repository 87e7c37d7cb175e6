# SPDX-License-Identifier: MIT
# The lanes for each instruction set. The files are optimised in every build: without inlining they are of no use.
target_sources(quarzel_objects PRIVATE lanes/lanes.cpp)
foreach(name IN LISTS quarzel_sets)
  set(file lanes/lanes_${name}.cpp)
  target_sources(quarzel_objects PRIVATE ${file})
  set_source_files_properties(${file} PROPERTIES
    COMPILE_OPTIONS "$<IF:$<BOOL:${QUARZEL_SANITIZE}>,-O1,-O3>;${quarzel_flags_${name}}")
endforeach()
