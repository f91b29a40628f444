# host/shim: its tests, and the libraries and the program that they open, run and preload.
set(VELKSHIM_TEST_FOLDER ${CMAKE_CURRENT_LIST_DIR})
add_library(velkshim_test_library MODULE ${VELKSHIM_TEST_FOLDER}/shim_test_library.cpp)
add_library(velkshim_test_caller MODULE ${VELKSHIM_TEST_FOLDER}/shim_test_caller.cpp)
add_executable(velkshim_preload_program ${VELKSHIM_TEST_FOLDER}/shim_preload_program.cpp)
foreach(target velkshim_test_library velkshim_test_caller)
  target_link_libraries(${target} PRIVATE velk_options)
endforeach()
# Its call must not become a jump, or it would not be the caller any more.
target_compile_options(velkshim_test_caller PRIVATE -fno-optimize-sibling-calls)
set_target_properties(velkshim_test_library PROPERTIES
  LIBRARY_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/lib/neighbour)
set_target_properties(velkshim_test_caller PROPERTIES
  BUILD_RPATH "$ORIGIN/neighbour" LINK_OPTIONS -Wl,--enable-new-dtags)
# A program of somebody else's: without this project's options and without sanitizers, whose
# run-time libraries want to be loaded before any preload.
target_link_libraries(velkshim_preload_program PRIVATE Threads::Threads)

velk_add_tests(shim_tests LABEL shim
  SOURCES
    ${VELKSHIM_TEST_FOLDER}/shim_clock_test.cpp
    ${VELKSHIM_TEST_FOLDER}/shim_files_test.cpp
    ${VELKSHIM_TEST_FOLDER}/shim_host_test.cpp
    ${VELKSHIM_TEST_FOLDER}/shim_observer_test.cpp
    ${VELKSHIM_TEST_FOLDER}/shim_paths_test.cpp
    ${VELKSHIM_TEST_FOLDER}/shim_threads_test.cpp
    ${PROJECT_SOURCE_DIR}/host/shim/fixed_paths.cpp  # once more, with sanitizers
  LIBS velkshim)
target_compile_definitions(shim_tests PRIVATE
  VELKSHIM_LIBRARY="$<TARGET_FILE:velkshim>"
  VELKSHIM_TEST_LIBRARY="$<TARGET_FILE:velkshim_test_library>"
  VELKSHIM_TEST_CALLER="$<TARGET_FILE:velkshim_test_caller>"
  VELKSHIM_TEST_PROGRAM="$<TARGET_FILE:velkshim_preload_program>")
add_dependencies(shim_tests
  velkshim_test_library velkshim_test_caller velkshim_preload_program)
