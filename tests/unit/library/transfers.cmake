# Files from servers, by a double of the file transfer service; hypervisor bundles, by a double of
# the hypervisor's provider.
velk_add_tests(library_transfer_tests LABEL unit.library
  SOURCES
    hypervisor_install_test.cpp
    hypervisor_job_test.cpp
    remote_request_test.cpp
    transfer_sftp_test.cpp
    transfer_tftp_test.cpp
  LIBS velk_broker_test_support ${VELK_UNITS})
