# `cpack --preset release`: a Debian package for each part that is installed.
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME velkprovider)
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")  # each package has its own
set(CPACK_PACKAGE_VENDOR "the velkprovider authors")
set(CPACK_PACKAGE_CONTACT "The velkprovider authors <velkprovider@example.com>")
set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_PACKAGE_DIRECTORY ${CMAKE_BINARY_DIR}/packages-deb)
set(CPACK_STRIP_FILES ON)
set(CPACK_COMPONENTS_ALL velkprovider velkhost)
set(CPACK_COMPONENTS_GROUPING IGNORE)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS
  OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)

set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${CMAKE_BINARY_DIR}/lib)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)

set(CPACK_DEBIAN_VELKPROVIDER_PACKAGE_NAME velkprovider)
set(CPACK_DEBIAN_VELKPROVIDER_PACKAGE_SECTION admin)
set(CPACK_COMPONENT_VELKPROVIDER_DESCRIPTION
"CMPI provider that installs firmware and software updates
A CIM broker of the host loads the library, and an update manager calls its
InstallFromURI with a list of packages. They are fetched, put in order and
installed by the management controller, the hypervisor, or the adapters'
vendors' providers.
.
Where a broker's staging tools are installed, class and registration are
staged; the broker takes them when it is next started.")
set(CPACK_DEBIAN_VELKPROVIDER_PACKAGE_CONTROL_EXTRA
  ${PROJECT_SOURCE_DIR}/packaging/velkprovider/postinst
  ${PROJECT_SOURCE_DIR}/packaging/velkprovider/postrm)

set(CPACK_DEBIAN_VELKHOST_PACKAGE_NAME velkhost)
set(CPACK_DEBIAN_VELKHOST_PACKAGE_SECTION devel)
set(CPACK_DEBIAN_VELKHOST_PACKAGE_DEPENDS "velkprovider (= ${PROJECT_VERSION})")
set(CPACK_COMPONENT_VELKHOST_DESCRIPTION
"stand-in host for the velkprovider library
Everything that surrounds the library on a real host: broker, the other
providers, job and unzip libraries, management controller and clock. The
velkhost command installs update packages on it, and serves it to WBEM
clients; scenarios say what the host has and what fails.")

include(CPack)
