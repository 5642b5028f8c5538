# The same packages for machines that speak RPM.
set(CPACK_RPM_COMPONENT_INSTALL ON)
set(CPACK_RPM_FILE_NAME RPM-DEFAULT)
set(CPACK_RPM_PACKAGE_LICENSE MIT)
set(CPACK_RPM_COMPRESSION_TYPE xz)
list(APPEND CPACK_PRE_BUILD_SCRIPTS ${CMAKE_CURRENT_SOURCE_DIR}/rpm_folders.cmake)
# The library knows where it stands.
set(CPACK_RPM_PACKAGE_RELOCATABLE OFF)
set(CPACK_RPM_PACKAGE_ARCHITECTURE x86_64)
if(word_size EQUAL 32)
  set(CPACK_RPM_PACKAGE_ARCHITECTURE i686)
endif()
set(CPACK_RPM_MODULE_PACKAGE_NAME kldrprovider)
set(CPACK_RPM_MODULE_PACKAGE_SUMMARY "${CPACK_PACKAGE_DESCRIPTION_SUMMARY}")
set(CPACK_RPM_MODULE_PACKAGE_DESCRIPTION "${CPACK_PACKAGE_DESCRIPTION}")
set(CPACK_RPM_MODULE_PACKAGE_REQUIRES /usr/bin/pgrep)
set(CPACK_RPM_DEBUG_PACKAGE_NAME kldrprovider-debuginfo)
set(CPACK_RPM_DEBUG_PACKAGE_SUMMARY "Debug symbols of kldrprovider")
set(CPACK_RPM_DEBUG_PACKAGE_REQUIRES "kldrprovider = ${PROJECT_VERSION}")
# Folders of the system's own, and what only Debian reads.
set(CPACK_RPM_EXCLUDE_FROM_AUTO_FILELIST_ADDITION
    /usr/lib/debug /usr/lib/debug/.build-id /usr/share/doc/kldrprovider-dbgsym /usr/sbin /usr/share/bash-completion /usr/share/bash-completion/completions
    /usr/share/fish /usr/share/fish/vendor_completions.d /usr/share/zsh /usr/share/zsh/site-functions
    /usr/share/lintian /usr/share/lintian/overrides /usr/share/lintian/overrides/kldrprovider
    /usr/share/man /usr/share/man/man1 /usr/share/man/man5 /usr/share/man/man7 /usr/share/man/man8)
# Stripped and split already, on no machine in particular, at a time that cpack was told.
string(CONCAT CPACK_RPM_SPEC_MORE_DEFINE
       "%define __os_install_post %{nil}\n"
       "%define debug_package %{nil}\n"
       "%define _build_id_links none\n"
       "%define _buildhost kldr.invalid\n"
       "%define use_source_date_epoch_as_buildtime 1\n"
       "%define clamp_mtime_to_source_date_epoch 1")

# kldr_rpm_script(<RPM's name> <Debian's name> <words>): Debian's script, called with Debian's words. RPM itself counts how many
# of the package will be there; `words` is shell that makes Debian's words of it.
function(kldr_rpm_script phase script words)
  set(source ${CMAKE_CURRENT_SOURCE_DIR}/debian/${script})
  if(EXISTS ${source})
    set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${source})
    file(READ ${source} text)
    string(REGEX REPLACE "^#![^\n]*\n" "" text "${text}")
    file(WRITE ${deployment}/rpm/${script} "${words}\n${text}")
    set(CPACK_RPM_MODULE_${phase}_SCRIPT_FILE ${deployment}/rpm/${script} PARENT_SCOPE)
  endif()
endfunction()
kldr_rpm_script(PRE_UNINSTALL prerm [[if [ "$1" = 0 ]; then set -- remove; else set -- upgrade; fi]])
kldr_rpm_script(POST_UNINSTALL postrm [[if [ "$1" = 0 ]; then set -- purge; else set -- upgrade; fi]])
kldr_rpm_script(POST_INSTALL postinst [[if [ "$1" -gt 1 ]; then set -- configure former; else set -- configure ""; fi]])
