# Run by cpack on what it is about to pack: zsh looks in another folder outside Debian.
if(CPACK_GENERATOR STREQUAL "RPM")
  file(GLOB shared ${CPACK_TEMPORARY_DIRECTORY}/*/usr/share/zsh)
  foreach(folder ${shared})
    file(RENAME ${folder}/vendor-completions ${folder}/site-functions)
  endforeach()
endif()
