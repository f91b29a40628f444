# GoogleTest from its source package, so that each build has it with its own ABI and sanitizers,
# and one way to declare a test program.

set(VELK_GTEST_SOURCE /usr/src/googletest CACHE PATH "GoogleTest source tree")
set(BUILD_GMOCK ON CACHE BOOL "" FORCE)
set(INSTALL_GTEST OFF CACHE BOOL "" FORCE)
add_subdirectory(${VELK_GTEST_SOURCE} ${CMAKE_BINARY_DIR}/googletest EXCLUDE_FROM_ALL SYSTEM)
foreach(target gtest gtest_main gmock gmock_main)
  target_link_libraries(${target} PRIVATE velk_sanitizers)
endforeach()

include(GoogleTest)

# How tests are compiled other than what they test: the optimiser, and checks for undefined
# behaviour in GoogleTest's many instantiations, would take most of a build's time.
function(velk_compile_as_test name)
  target_link_libraries(${name} PRIVATE velk_options gmock_main)
  target_compile_options(${name} PRIVATE $<$<CONFIG:Release>:-O0>)
  set_target_properties(${name} PROPERTIES VELK_UNDEFINED_UNCHECKED ON)
endfunction()

# The headers that most tests take, read once for all test programs.
file(CONFIGURE OUTPUT ${CMAKE_BINARY_DIR}/test_headers.cpp CONTENT "")
# A program, because it is compiled as those that take the headers from it.
add_executable(velk_test_headers EXCLUDE_FROM_ALL ${CMAKE_BINARY_DIR}/test_headers.cpp)
velk_compile_as_test(velk_test_headers)
target_precompile_headers(velk_test_headers PRIVATE
  <gmock/gmock.h> <gtest/gtest.h>
  <algorithm> <array> <atomic> <filesystem> <fstream> <map> <thread>)

# velk_add_tests(NAME SOURCES... [LIBS ...] [LABEL ...] [ONE_THREAD])
# Each TEST becomes a ctest case of its own and so runs in a process of its own. What never has
# more than ONE_THREAD is of no interest to the thread sanitizer, whose build leaves it out.
function(velk_add_tests name)
  cmake_parse_arguments(ARG "ONE_THREAD" "LABEL" "SOURCES;LIBS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE ${ARG_LIBS})
  velk_compile_as_test(${name})
  target_precompile_headers(${name} REUSE_FROM velk_test_headers)
  if(ARG_ONE_THREAD AND VELK_SANITIZE STREQUAL "thread")
    set_target_properties(${name} PROPERTIES EXCLUDE_FROM_ALL ON)
    return()
  endif()
  # A parameter's value would bring addresses into the names.
  gtest_discover_tests(${name} TEST_PREFIX "${ARG_LABEL}." NO_PRETTY_VALUES DISCOVERY_TIMEOUT 120
    PROPERTIES LABELS "${ARG_LABEL}" TIMEOUT 120)
endfunction()
