# SPDX-License-Identifier: MIT
# How targets of ours are made: a folder's sources are found, not listed, so that a new file pair
# needs no edit here.

# kestro_library(NAME [SOURCES_IN DIR...] [HEADERS FILE...] [LINK ...] [PRIVATE_LINK ...])
# HEADERS are what others may include; every header of the folders unless given. With the tests
# (those under sanitizers apart) it is seen that each of them can be compiled alone.
function(kestro_library name)
  cmake_parse_arguments(ARG "" "" "SOURCES_IN;HEADERS;LINK;PRIVATE_LINK" ${ARGN})
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
    set_target_properties(${name} PROPERTIES UNITY_BUILD ${KESTRO_UNITY})
    if(NOT KESTRO_SANITIZERS)  # it takes optimised code
      target_compile_options(${name} PRIVATE $<$<CONFIG:RelWithDebInfo>:-D_FORTIFY_SOURCE=2>)
    endif()
  endif()
  if(KESTRO_BUILD_TESTS AND NOT KESTRO_SANITIZERS)
    kestro_check_headers(${name} ${headers})
  endif()
endfunction()

# kestro_check_headers(LIBRARY HEADER...): compiles headers alone, those without a source of their
# own. The others are the first that their sources include (see Tests/Structure), and so need no more
# than they include themselves.
function(kestro_check_headers library)
  set(units)
  foreach(header IN LISTS ARGN)
    cmake_path(REPLACE_EXTENSION header LAST_ONLY .cpp OUTPUT_VARIABLE source)
    if(EXISTS ${source})
      continue()
    endif()
    cmake_path(RELATIVE_PATH header BASE_DIRECTORY ${PROJECT_SOURCE_DIR})
    set(unit ${CMAKE_CURRENT_BINARY_DIR}/Headers/${header}.cpp)
    file(CONFIGURE OUTPUT ${unit} CONTENT "#include \"@header@\"\n#include \"@header@\"\n" @ONLY)
    list(APPEND units ${unit})
  endforeach()
  if(units)
    add_library(${library}Headers OBJECT ${units})
    target_link_libraries(${library}Headers PRIVATE ${library})
    target_compile_options(${library}Headers PRIVATE -O0 -g0)
  endif()
endfunction()

# kestro_tests(NAME [SOURCES_IN DIR...] [LINK ...]): one test program, its tests registered by name
# (under sanitizers a part of them at a time).
function(kestro_tests name)
  cmake_parse_arguments(ARG "" "" "SOURCES_IN;LINK" ${ARGN})
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
  set_target_properties(${name} PROPERTIES UNITY_BUILD ${KESTRO_UNITY_TESTS})
  # What is tested is optimised; the tests themselves would only take twice as long to compile.
  target_compile_options(${name} PRIVATE -O0)
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
