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

# velk_add_tests(NAME SOURCES... [LIBS ...] [LABEL ...])
# Each TEST becomes a ctest case of its own and so runs in a process of its own.
function(velk_add_tests name)
  cmake_parse_arguments(ARG "" "LABEL" "SOURCES;LIBS" ${ARGN})
  add_executable(${name} ${ARG_SOURCES})
  target_link_libraries(${name} PRIVATE velk_options ${ARG_LIBS} gmock_main)
  # Most of a test's time in the compiler goes to GoogleTest's headers and to the optimiser.
  target_precompile_headers(${name} PRIVATE <gmock/gmock.h> <gtest/gtest.h>)
  target_compile_options(${name} PRIVATE $<$<CONFIG:Release>:-O0>)
  # A parameter's value would bring addresses into the names.
  gtest_discover_tests(${name} TEST_PREFIX "${ARG_LABEL}." NO_PRETTY_VALUES DISCOVERY_TIMEOUT 120
    PROPERTIES LABELS "${ARG_LABEL}" TIMEOUT 120)
endfunction()
