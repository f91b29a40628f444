# Where everything goes when it is installed, in two parts:
#   velkprovider   for a host with a broker: the library, its class and its registration
#   velkhost       the stand-in host and its tools; its shape is told in host/rig/parts.h
if(CMAKE_INSTALL_PREFIX_INITIALIZED_TO_DEFAULT)
  set(CMAKE_INSTALL_PREFIX /usr CACHE PATH "Where to install" FORCE)
endif()

# velk_install_documents(PART FILES...): documents of a part, with what Debian wants beside them.
function(velk_install_documents part)
  install(FILES ${ARGN} DESTINATION share/doc/${part} COMPONENT ${part})
  install(FILES ${PROJECT_SOURCE_DIR}/LICENSE DESTINATION share/doc/${part} RENAME copyright
    COMPONENT ${part})
  velk_install_compressed(${part} packaging/changelog share/doc/${part})
endfunction()

# velk_install_compressed(PART FILE FOLDER): the file with gzip's ending, the same bytes every time.
function(velk_install_compressed part file folder)
  get_filename_component(name ${file} NAME)
  set(compressed ${CMAKE_BINARY_DIR}/compressed/${part}/${name}.gz)
  add_custom_command(OUTPUT ${compressed}
    COMMAND ${CMAKE_COMMAND} -E make_directory ${CMAKE_BINARY_DIR}/compressed/${part}
    COMMAND gzip -9nc ${PROJECT_SOURCE_DIR}/${file} > ${compressed}
    DEPENDS ${PROJECT_SOURCE_DIR}/${file} VERBATIM)
  add_custom_target(${part}_${name}_compressed ALL DEPENDS ${compressed})
  install(FILES ${compressed} DESTINATION ${folder} COMPONENT ${part})
endfunction()

# ---- For a host with a broker ----

install(TARGETS velkprovider LIBRARY DESTINATION lib/cim COMPONENT velkprovider)
# A broker has the base classes from the DMTF schema; ours are for one that has none.
file(READ mof/velk_cimv2.mof staged_mof)
string(REGEX REPLACE "#pragma include [^\n]*\n" "" staged_mof "${staged_mof}")
file(CONFIGURE OUTPUT ${CMAKE_BINARY_DIR}/installed/velk_cimv2.mof CONTENT "${staged_mof}" @ONLY)
install(FILES ${CMAKE_BINARY_DIR}/installed/velk_cimv2.mof mof/registration/velkprovider.reg
  DESTINATION share/velkprovider COMPONENT velkprovider)
install(FILES mof/cim_base.mof mof/cim_qualifiers.mof DESTINATION share/velkprovider/base
  COMPONENT velkprovider)
velk_install_documents(velkprovider docs/operator.md docs/packager.md)

if(VELK_LIBRARY_ONLY)
  return()
endif()

# ---- The stand-in host ----

set(VELKHOST_LIBRARIES
  velkshim velkbroker velkscenario concretejob unzipfile velkfetch
  zebmanagementcontroller zebfiletransfer hypervisorupdate
  adapteremulex adapterqlogic adapterbrocade adapterbroadcom adapterlsi)
foreach(target ${VELKHOST_LIBRARIES})
  if(TARGET ${target})
    set_target_properties(${target} PROPERTIES INSTALL_RPATH "$ORIGIN")
    install(TARGETS ${target}
      LIBRARY DESTINATION lib/velkhost/parts COMPONENT velkhost
      RUNTIME DESTINATION lib/velkhost/parts COMPONENT velkhost)
  endif()
endforeach()
install(TARGETS velkhost RUNTIME DESTINATION bin COMPONENT velkhost)

# The very file that a broker would load.
file(CREATE_LINK ../../cim/libvelkprovider.so ${CMAKE_BINARY_DIR}/installed/libvelkprovider.so SYMBOLIC)
install(FILES ${CMAKE_BINARY_DIR}/installed/libvelkprovider.so DESTINATION lib/velkhost/parts
  COMPONENT velkhost)

install(DIRECTORY mof/ DESTINATION share/velkhost/mof COMPONENT velkhost FILES_MATCHING PATTERN *.mof
  PATTERN registration EXCLUDE)
install(FILES mof/registration/velkprovider.reg host/providers/standin.reg
  DESTINATION share/velkhost/registration COMPONENT velkhost)
install(DIRECTORY scenarios DESTINATION share/velkhost COMPONENT velkhost)
install(DIRECTORY examples DESTINATION share/velkhost COMPONENT velkhost USE_SOURCE_PERMISSIONS)
velk_install_documents(velkhost docs/architecture.md docs/real-broker.md)
velk_install_compressed(velkhost docs/velkhost.1 share/man/man1)

include(VelkPackages)
