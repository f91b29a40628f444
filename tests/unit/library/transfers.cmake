# Files from servers, by a double of the file transfer service.
velk_add_tests(library_transfer_tests LABEL unit.library
  SOURCES
    remote_request_test.cpp
    transfer_sftp_test.cpp
    transfer_tftp_test.cpp
  LIBS velk_broker_test_support ${VELK_UNITS})
