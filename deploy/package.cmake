# `cpack` in a build folder: Debian packages, or RPMs, of the word size that was built. Both word sizes put the library into the
# same folder, since that is where it looks for the adapter library, so that a machine holds one of the two: that of its server.
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME kldrprovider)
set(CPACK_PACKAGE_VENDOR KLDR)
set(CPACK_PACKAGE_CONTACT "KLDR storage management <storage@kldr.invalid>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "CMPI provider module for Fibre Channel and converged network adapters")
set(CPACK_PACKAGE_DESCRIPTION
"A library that a CIM server loads: it publishes the host's adapters, their
ports, targets and logical units, firmware and drivers in the namespace
root/kaldera. kldr-register(8) tells the server of it; kldrcim(1) shows without
a server what a client would see.")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS
    OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)

# What is packed is stamped with the time of the newest entry of the changelog, unless SOURCE_DATE_EPOCH says another.
set(CPACK_PROJECT_CONFIG_FILE ${CMAKE_CURRENT_SOURCE_DIR}/package_time.cmake)
set(CPACK_KLDR_CHANGELOG ${CMAKE_CURRENT_SOURCE_DIR}/debian/changelog)

# Only a release has debug symbols worth a package.
set(CPACK_COMPONENTS_ALL module)
if(KLDR_RELEASE)
  list(APPEND CPACK_COMPONENTS_ALL debug)
endif()
set(CPACK_COMPONENT_DEBUG_DESCRIPTION 
    "Debug symbols of kldrprovider, for debuggers that look for them by build id.")

set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_COMPRESSION_TYPE xz)
if(word_size EQUAL 32)
  set(CPACK_DEBIAN_PACKAGE_ARCHITECTURE i386)
endif()
set(CPACK_DEBIAN_MODULE_PACKAGE_NAME kldrprovider)
set(CPACK_DEBIAN_MODULE_PACKAGE_SECTION admin)
set(CPACK_DEBIAN_MODULE_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_MODULE_PACKAGE_DEPENDS procps)
set(CPACK_DEBIAN_MODULE_DESCRIPTION "${CPACK_PACKAGE_DESCRIPTION}")
set(CPACK_DEBIAN_DEBUG_PACKAGE_NAME kldrprovider-dbgsym)
set(CPACK_DEBIAN_DEBUG_PACKAGE_SECTION debug)
set(CPACK_DEBIAN_DEBUG_PACKAGE_DEPENDS "kldrprovider (= ${PROJECT_VERSION})")
# Before its files go, the servers are told; registering is the administrator's own decision.
file(GLOB scripts CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/debian/p*inst ${CMAKE_CURRENT_SOURCE_DIR}/debian/p*rm)
set(CPACK_DEBIAN_MODULE_PACKAGE_CONTROL_EXTRA ${scripts})
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)

include(rpm_package.cmake)
include(CPack)
