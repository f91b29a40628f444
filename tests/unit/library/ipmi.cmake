# The library's IPMI functions against the stand-in host's device and controller.
if(TARGET velkbmc_device)
  velk_add_tests(library_ipmi_tests LABEL unit.library
    SOURCES
      controller_stand.cpp
      ipmi_answer_test.cpp
      ipmi_builders_test.cpp
      ipmi_calls.cpp
      ipmi_channel_test.cpp
      ipmi_device_test.cpp
      ipmi_fixture.cpp
      ipmi_start_test.cpp
      ipmi_status_test.cpp
      ipmi_transaction_test.cpp
      ipmi_watcher_test.cpp
    LIBS velk_test_support velkbmc_device ${VELK_UNITS})
  target_link_options(library_ipmi_tests PRIVATE LINKER:--wrap=ioctl)
endif()
