# The file transfer service's own parts, without a broker and without a network.
velk_add_tests(velkfiletransfer_tests LABEL providers
  SOURCES
    file_transfer_jobs_test.cpp
    file_transfer_location_test.cpp
    file_transfer_pool_test.cpp
    file_transfer_process_test.cpp
    file_transfer_store_test.cpp
    file_transfer_transfer_test.cpp
  LIBS velkfiletransfer)
