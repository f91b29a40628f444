# Transfers from real servers. What ./test.sh does not find installed it unpacks in build/servers.
if(NOT TARGET velkfetch)
  return()
endif()

find_program(VELK_SSHD sshd HINTS /usr/sbin ${PROJECT_SOURCE_DIR}/build/servers/usr/sbin)
find_program(VELK_ATFTPD atftpd HINTS /usr/sbin ${PROJECT_SOURCE_DIR}/build/servers/usr/sbin)
add_library(velk_transfer_servers OBJECT
  transfers/daemon.cpp
  transfers/loopback.cpp
  transfers/relay.cpp
  transfers/servers.cpp
  velkhost/process.cpp)
target_include_directories(velk_transfer_servers PUBLIC ${PROJECT_SOURCE_DIR})
target_link_libraries(velk_transfer_servers PRIVATE velk_options PUBLIC crypt)
# A server that is not there fails its tests, by name.
target_compile_definitions(velk_transfer_servers PRIVATE
  VELK_SSHD="$<IF:$<BOOL:${VELK_SSHD}>,${VELK_SSHD},sshd>"
  VELK_ATFTPD="$<IF:$<BOOL:${VELK_ATFTPD}>,${VELK_ATFTPD},atftpd>")

velk_add_tests(velkhost_transfer_tests LABEL integration
  SOURCES
    transfers/demo_test.cpp
    transfers/sftp_test.cpp
    transfers/tftp_test.cpp
    velkhost/fixture.cpp
  LIBS velk_transfer_servers)
add_dependencies(velkhost_transfer_tests velkhost velkfetch example_packages)
target_compile_definitions(velkhost_transfer_tests PRIVATE
  VELKHOST_PROGRAM="$<TARGET_FILE:velkhost>"
  VELK_PACKAGES_DIR="${VELK_PACKAGES_DIR}"
  VELK_EXAMPLES_DIR="${PROJECT_SOURCE_DIR}/examples"
  VELK_SCENARIO_DIR="${PROJECT_SOURCE_DIR}/scenarios"
  VELK_SOURCE_DIR="${PROJECT_SOURCE_DIR}")

velk_add_tests(velkrig_transfer_tests LABEL integration
  SOURCES transfers/service_test.cpp
  LIBS velkshim velkrig velk_transfer_servers)
add_dependencies(velkrig_transfer_tests velkfetch)
target_link_options(velkrig_transfer_tests PRIVATE LINKER:--no-as-needed)
