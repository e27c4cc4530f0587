# SPDX-License-Identifier: MIT
# How targets of ours are made: a folder's sources are found, not listed, so that a new file pair
# needs no edit here.

# What nearly every source includes, directly or not. It is precompiled, so that it is read once and
# not by every source; each still includes what it uses (see Tests/Structure).
set(standard_headers
  <algorithm> <array> <chrono> <cstddef> <cstdint> <functional> <map> <memory> <optional> <span>
  <string> <string_view> <unordered_map> <utility> <variant> <vector> <fmt/format.h> <fmt/ranges.h>)

set(unoptimised -O0 -U_FORTIFY_SOURCE)

# kestro_precompile(TARGET SHARED [HEADER...]): gives the target's sources the standard headers
# precompiled: those of the target SHARED or, with headers of its own, its own.
function(kestro_precompile name shared)
  if(NOT TARGET ${shared})
    return()
  elseif(ARGN)
    target_precompile_headers(${name} PRIVATE ${standard_headers} ${ARGN})
  else()
    target_precompile_headers(${name} REUSE_FROM ${shared})
  endif()
endfunction()

# kestro_add_precompiled(NAME [HEADERS HEADER...] [LINK ...] [OPTIONS OPTION...]): precompiled
# standard headers for targets that are compiled with the same options. clang cannot read g++'s.
function(kestro_add_precompiled name)
  cmake_parse_arguments(ARG "" "" "HEADERS;LINK;OPTIONS" ${ARGN})
  if(NOT KESTRO_PRECOMPILE OR NOT CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    return()
  endif()
  file(CONFIGURE OUTPUT ${CMAKE_CURRENT_BINARY_DIR}/${name}.cpp CONTENT "")
  add_library(${name} OBJECT ${CMAKE_CURRENT_BINARY_DIR}/${name}.cpp)
  target_link_libraries(${name} PRIVATE KestroCompiler fmt::fmt ${ARG_LINK})
  target_compile_options(${name} PRIVATE ${ARG_OPTIONS})
  target_precompile_headers(${name} PRIVATE ${standard_headers} ${ARG_HEADERS})
endfunction()

# kestro_library(NAME [SOURCES_IN DIR...] [HEADERS FILE...] [LINK ...] [PRIVATE_LINK ...])
# HEADERS are what others may include; every header of the folders unless given. Building KestroHeaders
# shows that each of them can be compiled alone. PRECOMPILED are headers from outside that its sources
# often include, where precompiling them pays.
function(kestro_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES_IN;HEADERS;LINK;PRIVATE_LINK;PRECOMPILED" ${ARGN})
  set(sources)
  set(headers ${ARG_HEADERS})
  foreach(directory IN LISTS ARG_SOURCES_IN)
    file(GLOB found CONFIGURE_DEPENDS ${directory}/*.cpp)
    list(FILTER found EXCLUDE REGEX "/main\\.cpp$")
    list(APPEND sources ${found})
    if(NOT ARG_HEADERS)
      file(GLOB found CONFIGURE_DEPENDS ${directory}/*.h)
      list(APPEND headers ${found})
    endif()
  endforeach()
  if(NOT sources)  # a room without furniture yet
    add_library(${name} INTERFACE)
    target_link_libraries(${name} INTERFACE KestroCompiler ${ARG_LINK} ${ARG_PRIVATE_LINK})
  else()
    add_library(${name} STATIC ${sources})
    target_link_libraries(${name} PUBLIC KestroCompiler ${ARG_LINK} PRIVATE ${ARG_PRIVATE_LINK})
    kestro_compile_together(${name} ${KESTRO_UNITY})
    kestro_precompile(${name} KestroPrecompiled ${ARG_PRECOMPILED})
  endif()
  if(KESTRO_BUILD_TESTS)
    kestro_check_headers(${name} ${headers})
  endif()
endfunction()

# kestro_compile_together(TARGET WHETHER): several sources at one time. The compiler takes all of
# them for headers then, and would not let their classes use what is in an unnamed namespace.
function(kestro_compile_together target whether)
  if(whether)
    set_target_properties(${target} PROPERTIES UNITY_BUILD ON)
    target_compile_options(${target} PRIVATE
      $<$<CXX_COMPILER_ID:GNU>:-Wno-subobject-linkage>)
  endif()
endfunction()

# kestro_check_headers(LIBRARY HEADER...): compiles headers alone, without precompiled ones, as a part
# of the target KestroHeaders, which is built when asked for.
add_custom_target(KestroHeaders)
function(kestro_check_headers library)
  set(units)
  foreach(header IN LISTS ARGN)
    cmake_path(RELATIVE_PATH header BASE_DIRECTORY ${PROJECT_SOURCE_DIR})
    set(unit ${CMAKE_CURRENT_BINARY_DIR}/Headers/${header}.cpp)
    file(CONFIGURE OUTPUT ${unit} CONTENT "#include \"@header@\"\n#include \"@header@\"\n" @ONLY)
    list(APPEND units ${unit})
  endforeach()
  if(units)
    add_library(${library}Headers OBJECT EXCLUDE_FROM_ALL ${units})
    add_dependencies(KestroHeaders ${library}Headers)
    target_link_libraries(${library}Headers PRIVATE ${library})
    target_compile_options(${library}Headers PRIVATE ${unoptimised} -g0)
  endif()
endfunction()

# kestro_tests(NAME [SOURCES_IN DIR...] [LINK ...]): one test program, its tests registered by name
# (under sanitizers a part of them at a time).
function(kestro_tests name)
  cmake_parse_arguments(ARG "" "" "SOURCES_IN;LINK;PRECOMPILED" ${ARGN})
  set(sources)
  foreach(directory IN LISTS ARG_SOURCES_IN)
    file(GLOB found CONFIGURE_DEPENDS ${directory}/*.cpp)
    list(APPEND sources ${found})
  endforeach()
  if(NOT sources)
    return()
  endif()
  add_executable(${name} ${sources})
  target_link_libraries(${name} PRIVATE KestroCompiler ${ARG_LINK} GTest::gmock)
  kestro_compile_together(${name} ${KESTRO_UNITY_TESTS})
  # What is tested is optimised; the tests themselves would only take twice as long to compile.
  target_compile_options(${name} PRIVATE ${unoptimised})
  kestro_precompile(${name} KestroPrecompiledTests ${ARG_PRECOMPILED})
  if(KESTRO_SANITIZERS)
    kestro_add_shards(${name} 4)
  else()
    gtest_discover_tests(${name} DISCOVERY_MODE PRE_TEST PROPERTIES TIMEOUT 120)
  endif()
endfunction()

# kestro_add_shards(PROGRAM COUNT): a test program's tests in so many runs. Instrumented, a program
# takes longer to start than most tests take.
function(kestro_add_shards program count)
  math(EXPR last "${count} - 1")
  foreach(shard RANGE ${last})
    add_test(NAME ${program}.${shard} COMMAND ${program})
    set_tests_properties(${program}.${shard} PROPERTIES
      TIMEOUT 600 ENVIRONMENT "GTEST_TOTAL_SHARDS=${count};GTEST_SHARD_INDEX=${shard}")
  endforeach()
endfunction()
