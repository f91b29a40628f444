# host/broker and host/cim: their tests.
set(VELKBROKER_TEST_FOLDER ${CMAKE_CURRENT_LIST_DIR})
set(velkbroker_test_sources)
foreach(test requests)
  list(APPEND velkbroker_test_sources ${VELKBROKER_TEST_FOLDER}/broker_${test}_test.cpp)
endforeach()

velk_add_tests(velkbroker_tests LABEL broker
  SOURCES ${velkbroker_test_sources} ${VELKBROKER_TEST_FOLDER}/broker_testing.cpp
  LIBS velkbroker)
