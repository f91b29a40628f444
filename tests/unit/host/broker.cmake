# host/broker and host/cim: their tests, and provider libraries, good and bad, to load.
set(VELKBROKER_TEST_FOLDER ${CMAKE_CURRENT_LIST_DIR})
set(VELKBROKER_TEST_LIBRARIES ${CMAKE_BINARY_DIR}/lib/broker_test_providers)

set(velkbroker_test_sources ${VELKBROKER_TEST_FOLDER}/cim_value_test.cpp)
foreach(test array context ledger loading path query registration repository requests tables text
             threads trace upcalls values)
  list(APPEND velkbroker_test_sources ${VELKBROKER_TEST_FOLDER}/broker_${test}_test.cpp)
endforeach()

velk_add_tests(velkbroker_tests LABEL broker
  SOURCES ${velkbroker_test_sources} ${VELKBROKER_TEST_FOLDER}/broker_testing.cpp
  LIBS velkbroker)
target_compile_definitions(velkbroker_tests PRIVATE
  VELKBROKER_TEST_LIBRARIES="${VELKBROKER_TEST_LIBRARIES}")

foreach(kind GOOD GENERIC NO_METHOD REFUSES UNRESOLVED EMPTY_SLOT)
  string(TOLOWER velkbroker_test_${kind} library)
  add_library(${library} MODULE ${VELKBROKER_TEST_FOLDER}/broker_test_provider.cpp)
  target_compile_definitions(${library} PRIVATE VELK_TEST_${kind})
  target_link_libraries(${library} PRIVATE velk_cmpi_bundled velk_options)
  set_target_properties(${library} PROPERTIES
    LIBRARY_OUTPUT_DIRECTORY ${VELKBROKER_TEST_LIBRARIES})
  add_dependencies(velkbroker_tests ${library})
endforeach()
