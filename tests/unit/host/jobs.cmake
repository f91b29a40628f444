# host/jobs: its tests, and the provider library whose jobs they watch.
add_library(velkjobs_test_provider MODULE jobs_test_provider.cpp)
target_include_directories(velkjobs_test_provider PRIVATE ${PROJECT_SOURCE_DIR})
target_link_libraries(velkjobs_test_provider PRIVATE velk_options)

velk_add_tests(velkjobs_tests LABEL jobs
  SOURCES
    jobs_instance_test.cpp
    jobs_polling_test.cpp
    jobs_registration_test.cpp
    ${PROJECT_SOURCE_DIR}/host/jobs/status_line.cpp
  LIBS velkshim velkbroker velkmof velkscenario)
add_dependencies(velkjobs_tests velkjobs_test_provider concretejob)
target_compile_definitions(velkjobs_tests PRIVATE
  VELK_MOF_DIR="${PROJECT_SOURCE_DIR}/mof"
  VELK_REGISTRATION="${PROJECT_SOURCE_DIR}/host/providers/standin.reg"
  VELK_PROVIDER_DIR="${CMAKE_LIBRARY_OUTPUT_DIRECTORY}"
  VELK_JOB_LIBRARY="$<TARGET_FILE:concretejob>"
  VELK_JOB_TEST_PROVIDER="$<TARGET_FILE:velkjobs_test_provider>")
