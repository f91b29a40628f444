velk_add_tests(velkrig_tests LABEL rig
  SOURCES
    rig_folder_test.cpp
    rig_network_test.cpp
    rig_status_history_test.cpp
    rig_status_line_test.cpp
  LIBS velkrig)
