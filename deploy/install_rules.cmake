# `cmake --install`: every file that a release puts on a machine. The simulator is not among them.
set(CMAKE_INSTALL_DEFAULT_COMPONENT_NAME module)
install(TARGETS kldrprovider_Module LIBRARY DESTINATION ${KLDR_PROVIDER_DIR})
install(TARGETS kldrcim RUNTIME DESTINATION bin)
install(PROGRAMS ${deployment}/kldr-register DESTINATION sbin)
install(FILES ${mof} DESTINATION share/kldrprovider/mof)
install(FILES ${registrations} DESTINATION share/kldrprovider/registration)
install(FILES ${CMAKE_SOURCE_DIR}/LICENSE DESTINATION share/doc/kldrprovider RENAME copyright)
# Where shells look for completion, by the name of the command. Packages for other distributions than Debian's have zsh's in
# another folder: rpm_folders.cmake.
install(FILES ${completion}/kldrcim.bash DESTINATION share/bash-completion/completions RENAME kldrcim)
install(FILES completion/kldr-register DESTINATION share/bash-completion/completions)
install(FILES ${completion}/kldrcim.zsh DESTINATION share/zsh/vendor-completions RENAME _kldrcim)
install(FILES ${completion}/kldrcim.fish DESTINATION share/fish/vendor_completions.d)
install(FILES ${completion}/classes DESTINATION share/kldrprovider/completion)
install(FILES examples/logrotate examples/kldrcim.service DESTINATION share/doc/kldrprovider/examples)
install(FILES monitoring/kldr_alerts.yml monitoring/kldr_dashboard.json DESTINATION share/doc/kldrprovider/examples)
install(FILES debian/lintian-overrides DESTINATION share/lintian/overrides RENAME kldrprovider)

# kldr_install_compressed(<file> <folder> <name>): without name and time of the original, so that the same text gives the same file.
function(kldr_install_compressed file folder name)
  set(compressed ${deployment}/compressed/${name}.gz)
  add_custom_command(
    OUTPUT ${compressed}
    COMMAND gzip -9nc ${CMAKE_CURRENT_SOURCE_DIR}/${file} > ${compressed}
    DEPENDS ${file})
  install(FILES ${compressed} DESTINATION ${folder})
  set_property(DIRECTORY APPEND PROPERTY KLDR_COMPRESSED ${compressed})
endfunction()
file(MAKE_DIRECTORY ${deployment}/compressed)
foreach(page kldrcim.1 cimplerc.5 kldrprovider.7 kldr-register.8)
  string(REGEX REPLACE "^.*\\." "" section ${page})
  kldr_install_compressed(man/${page} share/man/man${section} ${page})
endforeach()
kldr_install_compressed(debian/changelog share/doc/kldrprovider changelog)
get_property(compressed DIRECTORY PROPERTY KLDR_COMPRESSED)
add_custom_target(kldr_compressed DEPENDS ${compressed})
add_dependencies(kldr_deployment kldr_compressed)

# A link from each folder, relative, so that it holds below any root.
foreach(folder ${KLDR_LINK_DIRS})
  set(library $<TARGET_FILE_NAME:kldrprovider_Module>)
  file(RELATIVE_PATH target /prefix/${folder} /prefix/${KLDR_PROVIDER_DIR})
  install(DIRECTORY DESTINATION ${folder})
  install(CODE "
    set(folder \"\$ENV{DESTDIR}\${CMAKE_INSTALL_PREFIX}/${folder}\")
    file(CREATE_LINK \"${target}/${library}\" \"\${folder}/${library}\" SYMBOLIC)
    list(APPEND CMAKE_INSTALL_MANIFEST_FILES \"\${CMAKE_INSTALL_PREFIX}/${folder}/${library}\")
    message(STATUS \"Installing: \${folder}/${library}\")")
endforeach()

# Debug symbols of what is built, with the papers of the package that they belong to, where debuggers look for them by build id.
foreach(target kldrprovider_Module kldrcim)
  install(CODE "
    execute_process(COMMAND ${CMAKE_READELF} -n \"$<TARGET_FILE:${target}>\" OUTPUT_VARIABLE notes COMMAND_ERROR_IS_FATAL ANY)
    string(REGEX MATCH \"Build ID: (..)([0-9a-f]+)\" id \"\${notes}\")
    set(folder \"\$ENV{DESTDIR}\${CMAKE_INSTALL_PREFIX}/lib/debug/.build-id/\${CMAKE_MATCH_1}\")
    set(symbols \"\${folder}/\${CMAKE_MATCH_2}.debug\")
    file(MAKE_DIRECTORY \"\${folder}\")
    execute_process(COMMAND ${CMAKE_OBJCOPY} --only-keep-debug \"$<TARGET_FILE:${target}>\" \"\${symbols}\" COMMAND_ERROR_IS_FATAL ANY)
    file(CHMOD \"\${symbols}\" PERMISSIONS OWNER_READ OWNER_WRITE GROUP_READ WORLD_READ)
    message(STATUS \"Installing: \${symbols}\")"
    COMPONENT debug EXCLUDE_FROM_ALL)
endforeach()
install(CODE "
  set(papers \"\$ENV{DESTDIR}\${CMAKE_INSTALL_PREFIX}/share/doc\")
  file(MAKE_DIRECTORY \"\${papers}\")
  file(CREATE_LINK kldrprovider \"\${papers}/kldrprovider-dbgsym\" SYMBOLIC)"
  COMPONENT debug EXCLUDE_FROM_ALL)
