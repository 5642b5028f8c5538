# Run by cpack, before it packs.
if(NOT DEFINED ENV{SOURCE_DATE_EPOCH})
  file(STRINGS ${CPACK_KLDR_CHANGELOG} signatures REGEX "^ -- ")
  list(GET signatures 0 newest)
  string(REGEX REPLACE "^.*>  " "" time "${newest}")
  execute_process(COMMAND date -d "${time}" +%s OUTPUT_VARIABLE seconds OUTPUT_STRIP_TRAILING_WHITESPACE
                  COMMAND_ERROR_IS_FATAL ANY)
  set(ENV{SOURCE_DATE_EPOCH} ${seconds})
endif()
