# `cpack` in the build folder: a Debian package of the word size that was built. Both put the library into the same folder,
# since that is where it looks for the adapter library, so that a machine holds one of the two: that of its server.
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME kldrprovider)
set(CPACK_PACKAGE_VENDOR KLDR)
set(CPACK_PACKAGE_CONTACT "KLDR storage management <storage@kldr.invalid>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "CMPI provider module for Fibre Channel and converged network adapters")
set(CPACK_PACKAGE_DESCRIPTION
"A library that a CIM server loads: it publishes the host's adapters, their ports, targets and logical units, firmware and
drivers in the namespace root/kaldera. kldr-register(8) tells the server of it; kldrcim(1) shows without a server what a
client would see.")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION admin)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_DEPENDS procps)
if(word_size EQUAL 32)
  set(CPACK_DEBIAN_PACKAGE_ARCHITECTURE i386)
endif()
# Before its files go, the servers are told; registering is the administrator's own decision.
set(CPACK_DEBIAN_PACKAGE_CONTROL_EXTRA ${CMAKE_CURRENT_SOURCE_DIR}/debian/prerm ${CMAKE_CURRENT_SOURCE_DIR}/debian/postrm)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
include(CPack)
