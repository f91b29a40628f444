velk_add_tests(velkcli_tests LABEL cli
  SOURCES
    cli_network_test.cpp
    cli_options_test.cpp
    cli_report_test.cpp
    cli_text_test.cpp
    cli_views_test.cpp
  LIBS velkcli)
