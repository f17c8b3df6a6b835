# What Debian wants of files, and the same bytes of every build: runs on what was gathered for the
# packages, before they are made of it.

file(GLOB_RECURSE pages ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/*.[1-9])
list(FILTER pages INCLUDE REGEX /share/man/)
foreach(page IN LISTS pages)
  execute_process(COMMAND gzip -9 -n ${page} COMMAND_ERROR_IS_FATAL ANY)
endforeach()
if(DEFINED ENV{SOURCE_DATE_EPOCH})
  execute_process(COMMAND find ${CPACK_TEMPORARY_INSTALL_DIRECTORY}
    -exec touch --no-dereference --date=@$ENV{SOURCE_DATE_EPOCH} "{}" + COMMAND_ERROR_IS_FATAL ANY)
endif()
