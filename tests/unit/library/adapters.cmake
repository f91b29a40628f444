# What adapter packages take: the payloads that apply to an adapter, and the families' installers
# against doubles of their vendors' providers.
velk_add_tests(library_applicability_tests LABEL unit.library ONE_THREAD
  SOURCES
    applicability_lines_test.cpp
    applicability_order_test.cpp
    applicability_scanners_test.cpp
    applicability_table_test.cpp
  LIBS velk_test_support ${VELK_UNITS})

if(TARGET velkbmc_device)
  velk_add_tests(library_adapter_tests LABEL unit.library
    SOURCES
      adapter_families.cpp
      adapter_fixture.cpp
      adapter_frame_test.cpp
      adapter_service_test.cpp
      adapter_session_test.cpp
      adapter_status_test.cpp
      adapter_watching_test.cpp
      broadcom_test.cpp
      brocade_test.cpp
      controller_stand.cpp
      emulex_discovery_test.cpp
      emulex_install_test.cpp
      lsi_test.cpp
      qlogic_adapters_test.cpp
      qlogic_payload_test.cpp
      unpack_test.cpp
    LIBS velk_broker_test_support velk_unzip_double velkbmc_device ${VELK_UNITS})
endif()
