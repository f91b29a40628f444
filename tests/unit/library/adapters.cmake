# What adapter packages take: the payloads that apply to an adapter, and the families' installers
# against doubles of their vendors' providers.
velk_add_tests(library_applicability_tests LABEL unit.library
  SOURCES
    applicability_lines_test.cpp
    applicability_order_test.cpp
    applicability_scanners_test.cpp
    applicability_table_test.cpp
  LIBS velk_test_support ${VELK_UNITS})
