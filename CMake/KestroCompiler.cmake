# SPDX-License-Identifier: MIT
# Compiler settings, all on one interface target that every target of ours links.

option(KESTRO_BUILD_TESTS "Build the tests" ON)
option(KESTRO_BUILD_BENCHMARKS "Build the benchmarks" ON)
option(KESTRO_UNITY "Compile a library's sources several at a time" OFF)
option(KESTRO_UNITY_TESTS "Compile a test program's sources several at a time" OFF)
option(KESTRO_PRECOMPILE "Read the headers that nearly every source includes once (g++ only)" ON)
option(KESTRO_LIBFUZZER "Instrument everything for libFuzzer (clang only)" OFF)
set(KESTRO_SANITIZERS "" CACHE STRING "Sanitizers to build with, for instance address,undefined")

set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/bin)

# Line numbers and names are enough for back traces and profiles, at half the cost of -g.
set(CMAKE_CXX_FLAGS_RELWITHDEBINFO "-O2 -g1 -DNDEBUG")

# Compiling is mostly reading the same headers again. Sources that are compiled at one time must not
# give one name to different things, not even in unnamed namespaces.
set(CMAKE_UNITY_BUILD_BATCH_SIZE 12)

find_program(KESTRO_CCACHE ccache)
if(KESTRO_CCACHE AND NOT CMAKE_CXX_COMPILER_LAUNCHER)
  # Without this ccache caches nothing that takes a precompiled header.
  find_program(KESTRO_ENV env REQUIRED)
  set(CMAKE_CXX_COMPILER_LAUNCHER
    ${KESTRO_ENV} CCACHE_SLOPPINESS=pch_defines,time_macros ${KESTRO_CCACHE})
endif()

add_library(KestroCompiler INTERFACE)
target_compile_features(KestroCompiler INTERFACE cxx_std_20)
target_include_directories(KestroCompiler INTERFACE ${PROJECT_SOURCE_DIR})
target_compile_options(KestroCompiler INTERFACE
  -Wall -Wextra -Wconversion -Wshadow -Wnon-virtual-dtor -Woverloaded-virtual -Werror)
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  # gcc 12 sees overruns in inlined insertions into a vector of bytes that are none; the sanitizers
  # look for real ones.
  target_compile_options(KestroCompiler INTERFACE
    -Wno-array-bounds -Wno-stringop-overflow -Wno-stringop-overread)
  if(KESTRO_PRECOMPILE)
    target_compile_options(KestroCompiler INTERFACE -fpch-preprocess)  # for ccache
  endif()
endif()
if(NOT KESTRO_SANITIZERS)
  # Hardening: what a mistake in a parser could reach is checked, guarded or not writable.
  target_compile_options(KestroCompiler INTERFACE
    -fstack-protector-strong -fstack-clash-protection -fcf-protection
    $<$<CONFIG:RelWithDebInfo>:-D_FORTIFY_SOURCE=2>)  # it takes optimised code
  target_link_options(KestroCompiler INTERFACE -Wl,-z,relro,-z,now,-z,noexecstack)
endif()
if(KESTRO_SANITIZERS)
  target_compile_options(KestroCompiler INTERFACE
    -fsanitize=${KESTRO_SANITIZERS} -fno-sanitize-recover=all -fno-omit-frame-pointer)
  target_link_options(KestroCompiler INTERFACE -fsanitize=${KESTRO_SANITIZERS})
endif()
if(KESTRO_LIBFUZZER)
  target_compile_options(KestroCompiler INTERFACE -fsanitize=fuzzer-no-link)
endif()
