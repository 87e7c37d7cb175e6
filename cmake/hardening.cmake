# SPDX-License-Identifier: MIT
# What makes a fault harder to exploit: checks of the stack and of the C library's copies, relocations that are done at
# the start and then read-only, no stack that can be executed. The sanitizers have checks of their own.
if(NOT QUARZEL_HARDEN OR QUARZEL_SANITIZE)
  return()
endif()
include(CheckCXXCompilerFlag)
include(CheckLinkerFlag)
check_cxx_compiler_flag(-fstack-protector-strong QUARZEL_HAS_STACK_PROTECTOR)
if(QUARZEL_HAS_STACK_PROTECTOR)
  add_compile_options(-fstack-protector-strong)
endif()
if(CMAKE_CXX_COMPILER_ID MATCHES "GNU|Clang")
  # Without an optimiser the C library warns that it has no such checks.
  add_compile_options("$<$<CONFIG:Release,RelWithDebInfo,MinSizeRel>:-U_FORTIFY_SOURCE;-D_FORTIFY_SOURCE=2>")
endif()
check_linker_flag(CXX "LINKER:-z,relro,-z,now,-z,noexecstack" QUARZEL_HAS_LINK_HARDENING)
if(QUARZEL_HAS_LINK_HARDENING)
  add_link_options(LINKER:-z,relro,-z,now,-z,noexecstack)
endif()
