# Adds the documents that Debian requires to the files of the package: copyright, changelog, and compressed manual pages.

set(documents ${CPACK_TEMPORARY_DIRECTORY}/usr/share/doc/varnel)
file(COPY ${CMAKE_CURRENT_LIST_DIR}/copyright ${CMAKE_CURRENT_LIST_DIR}/changelog DESTINATION ${documents}
     FILE_PERMISSIONS OWNER_READ OWNER_WRITE GROUP_READ WORLD_READ)
file(GLOB pages ${CPACK_TEMPORARY_DIRECTORY}/usr/share/man/man[18]/*.[18])
# -n leaves out the time of packaging, so that the same sources make the same file.
execute_process(COMMAND gzip -9 -n -f ${documents}/changelog ${pages} COMMAND_ERROR_IS_FATAL ANY)
