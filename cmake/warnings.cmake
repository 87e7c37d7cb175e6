# SPDX-License-Identifier: MIT
# Warnings are errors in the project's own targets, unless QUARZEL_WERROR is off.
function(quarzel_warnings target)
  target_compile_options(${target} PRIVATE -Wall -Wextra -Wshadow -Wconversion
    $<$<BOOL:${QUARZEL_WERROR}>:-Werror>
    # GCC 12 sees an overlap in every inlined "text" + std::string, where there is none (its bug 105651).
    $<$<COMPILE_LANG_AND_ID:CXX,GNU>:-Wno-restrict>)
endfunction()
