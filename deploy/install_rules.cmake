# `cmake --install`: every file that a release puts on a machine. The simulator is not among them.
install(TARGETS kldrprovider_Module LIBRARY DESTINATION ${KLDR_PROVIDER_DIR})
install(TARGETS kldrcim RUNTIME DESTINATION bin)
install(PROGRAMS ${deployment}/kldr-register DESTINATION sbin)
install(FILES ${mof} DESTINATION share/kldrprovider/mof)
install(FILES ${registrations} DESTINATION share/kldrprovider/registration)
install(FILES man/kldrcim.1 DESTINATION share/man/man1)
install(FILES man/cimplerc.5 DESTINATION share/man/man5)
install(FILES man/kldrprovider.7 DESTINATION share/man/man7)
install(FILES man/kldr-register.8 DESTINATION share/man/man8)
install(FILES ${CMAKE_SOURCE_DIR}/LICENSE DESTINATION share/doc/kldrprovider RENAME copyright)

# A link from each folder, relative, so that it holds below any root.
foreach(folder ${KLDR_LINK_DIRS})
  set(library $<TARGET_FILE_NAME:kldrprovider_Module>)
  file(RELATIVE_PATH target /prefix/${folder} /prefix/${KLDR_PROVIDER_DIR})
  install(CODE "
    set(folder \"\$ENV{DESTDIR}\${CMAKE_INSTALL_PREFIX}/${folder}\")
    file(MAKE_DIRECTORY \"\${folder}\")
    file(CREATE_LINK \"${target}/${library}\" \"\${folder}/${library}\" SYMBOLIC)
    list(APPEND CMAKE_INSTALL_MANIFEST_FILES \"\${CMAKE_INSTALL_PREFIX}/${folder}/${library}\")
    message(STATUS \"Installing: \${folder}/${library}\")")
endforeach()
