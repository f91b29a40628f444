# host/bmc and the shim's device: the model alone, the link to QEMU, and both behind /dev/ipmi0.
set(VELKBMC_TEST_FOLDER ${CMAKE_CURRENT_LIST_DIR})
velk_add_tests(velkbmc_tests LABEL bmc
  SOURCES
    ${VELKBMC_TEST_FOLDER}/bmc_controller_test.cpp
    ${VELKBMC_TEST_FOLDER}/bmc_elements_test.cpp
    ${VELKBMC_TEST_FOLDER}/bmc_faults_test.cpp
    ${VELKBMC_TEST_FOLDER}/bmc_link_test.cpp
    ${VELKBMC_TEST_FOLDER}/bmc_server_test.cpp
    ${VELKBMC_TEST_FOLDER}/bmc_transaction_test.cpp
  LIBS velkbmc)
velk_add_tests(shim_device_tests LABEL shim
  SOURCES
    ${VELKBMC_TEST_FOLDER}/shim_device_calls_test.cpp
    ${VELKBMC_TEST_FOLDER}/shim_device_poll_test.cpp
    ${VELKBMC_TEST_FOLDER}/shim_device_timing_test.cpp
  LIBS velkbmc_device)
