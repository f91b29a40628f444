# The hypervisor's provider in a broker, with bundles that the tests make.
velk_add_tests(velkhypervisor_tests LABEL providers
  SOURCES
    providers_hypervisor_bundles_test.cpp
    providers_hypervisor_jobs_test.cpp
    providers_hypervisor_test.cpp
  LIBS velkbroker velkmof velkscenario velk_depot_files)
add_dependencies(velkhypervisor_tests hypervisorupdate)
target_compile_definitions(velkhypervisor_tests PRIVATE
  VELK_MOF_DIR="${PROJECT_SOURCE_DIR}/mof"
  VELK_REGISTRATION="${PROJECT_SOURCE_DIR}/host/providers/standin.reg"
  VELK_PROVIDER_DIR="${CMAKE_LIBRARY_OUTPUT_DIRECTORY}")
