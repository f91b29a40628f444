# host/cimxml: readers and writers by themselves, operations on a broker with scripted providers, and
# the server on sockets of the loopback.
velk_add_tests(velkcimxml_tests LABEL cimxml
  SOURCES
    broker_testing.cpp
    cimxml_authentication_test.cpp
    cimxml_classes_test.cpp
    cimxml_endpoint_test.cpp
    cimxml_headers_test.cpp
    cimxml_http_test.cpp
    cimxml_instances_test.cpp
    cimxml_methods_test.cpp
    cimxml_server_test.cpp
    cimxml_xml_test.cpp
  LIBS velkcimxml velkmof)
