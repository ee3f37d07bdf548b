# One interface target carries the warnings, the include root and the sanitizers for all of ours.
# Warnings are errors in the presets that we test with only: what another compiler or another level
# warns about must not stop a packager.
add_library(ventrik-options INTERFACE)
target_include_directories(ventrik-options INTERFACE ${PROJECT_SOURCE_DIR})
target_compile_options(ventrik-options INTERFACE
  -Wall -Wextra -Wpedantic -Wshadow -Wconversion
  $<$<CXX_COMPILER_ID:Clang>:-Wno-sign-conversion>) # GCC's -Wconversion does not mean that

if(VENTRIK_SANITIZE)
  target_compile_definitions(ventrik-options INTERFACE VENTRIK_SANITIZED)
  target_compile_options(ventrik-options INTERFACE
    -fsanitize=address -fno-sanitize-recover=all -fno-omit-frame-pointer
    # Those checks count in what is tested; in the tests they take longest of all to compile.
    $<$<NOT:$<BOOL:$<TARGET_PROPERTY:VENTRIK_TESTS>>>:-fsanitize=undefined>)
  target_link_options(ventrik-options INTERFACE -fsanitize=address,undefined)
endif()

if(VENTRIK_COVERAGE)
  target_compile_options(ventrik-options INTERFACE --coverage -O0)
  target_link_options(ventrik-options INTERFACE --coverage)
endif()

if(VENTRIK_FUZZ)
  target_compile_options(ventrik-options INTERFACE
    -fsanitize=fuzzer-no-link,address,undefined -fno-omit-frame-pointer)
  target_link_options(ventrik-options INTERFACE -fsanitize=address,undefined)
endif()

# ventrik_precompile(TARGET headers...): these are read once for all of the target's files, in presets
# that want it. The others find out what a file forgot to include.
function(ventrik_precompile name)
  if(VENTRIK_PRECOMPILED)
    target_precompile_headers(${name} PRIVATE ${ARGN})
    if(CMAKE_CXX_COMPILER_ID STREQUAL GNU)
      target_compile_options(${name} PRIVATE -fpch-preprocess)
    endif()
  endif()
endfunction()

# ventrik_library(NAME sources...): one library of ours, with the house options.
function(ventrik_library name)
  add_library(${name} STATIC ${ARGN})
  target_link_libraries(${name} PUBLIC ventrik-options)
  list(LENGTH ARGN count) # for a few files it takes longer than it saves
  if(count GREATER 8)
    ventrik_precompile(${name} <algorithm> <array> <functional> <map> <memory> <optional> <ranges>
      <span> <string> <unordered_map> <variant> <vector> <fmt/format.h>)
  endif()
endfunction()

# ventrik_test_options(TARGET): how the tests' own code is compiled.
function(ventrik_test_options target)
  target_link_libraries(${target} PRIVATE ventrik-options fmt::fmt GTest::gmock)
  # The tests' own code is not worth its optimisation, which takes longer than their running. Qt's
  # wants to be position-independent; with the others the same, all share one precompiled header.
  target_compile_options(${target} PRIVATE $<$<CONFIG:Debug>:-O0> -fPIC)
  set_target_properties(${target} PROPERTIES VENTRIK_TESTS ON)
  if(CMAKE_CXX_COMPILER_ID STREQUAL GNU)
    target_compile_options(${target} PRIVATE -fpch-preprocess)
  endif()
endfunction()

# ventrik_test(NAME [WAITING] [ALONE FILTER] LIBRARIES ... SOURCES ...): a GoogleTest program whose
# tests ctest knows one by one; those of a WAITING one wait for other processes most of the time, and
# those that match ALONE, a GoogleTest filter, are timed so closely that nothing runs beside them.
function(ventrik_test name)
  cmake_parse_arguments(ARG "WAITING" "ALONE" "LIBRARIES;SOURCES;PROPERTIES" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_LIBRARIES})
  ventrik_test_options(${name})
  target_precompile_headers(${name} REUSE_FROM ventrik-test-headers)
  # Under the sanitizers a program's start takes longer than most tests: tests share one, unless they
  # mostly wait.
  if(NOT VENTRIK_SANITIZE OR ARG_WAITING)
    set(others)
    if(ARG_ALONE)
      set(others TEST_FILTER "-${ARG_ALONE}")
      gtest_discover_tests(${name} TEST_FILTER "${ARG_ALONE}" DISCOVERY_TIMEOUT 60
        PROPERTIES TIMEOUT 120 RUN_SERIAL ON ${ARG_PROPERTIES})
    endif()
    gtest_discover_tests(${name} ${others} DISCOVERY_TIMEOUT 60
      PROPERTIES TIMEOUT 120 ${ARG_PROPERTIES})
    return()
  endif()
  set(shards 4)
  math(EXPR last "${shards} - 1")
  foreach(shard RANGE ${last})
    add_test(NAME ${name}-${shard} COMMAND ${name} --gtest_brief=1)
    set_tests_properties(${name}-${shard} PROPERTIES TIMEOUT 600 ${ARG_PROPERTIES})
    set_property(TEST ${name}-${shard} APPEND PROPERTY
      ENVIRONMENT GTEST_TOTAL_SHARDS=${shards} GTEST_SHARD_INDEX=${shard})
  endforeach()
endfunction()
