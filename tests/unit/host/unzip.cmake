# host/unzip: its object code, so that sanitizers and coverage see into it, and the shared object.
velk_add_tests(unzip_tests LABEL unzip
  SOURCES
    unzip_archives_test.cpp
    unzip_damage_test.cpp
    unzip_fixture.cpp
    unzip_limits_test.cpp
    unzip_names_test.cpp
    ${PROJECT_SOURCE_DIR}/tests/support/files.cpp
  LIBS velkunzip z)
target_compile_definitions(unzip_tests PRIVATE VELK_UNZIP_LIBRARY="$<TARGET_FILE:unzipfile>")
add_dependencies(unzip_tests unzipfile)
