# CPack runs this on the files to be packed: it compresses the documents and moves them to Debian's places for them.
set(usr ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/usr)
set(documents ${usr}/share/doc/${CPACK_PACKAGE_NAME})
set(source ${CMAKE_CURRENT_LIST_DIR}/..)

file(COPY ${source}/resources/debian/copyright ${source}/CHANGELOG.md DESTINATION ${documents}
    FILE_PERMISSIONS OWNER_READ OWNER_WRITE GROUP_READ WORLD_READ)
string(TIMESTAMP date "%a, %d %b %Y %H:%M:%S +0000" UTC)
file(WRITE ${documents}/changelog
"${CPACK_PACKAGE_NAME} (${CPACK_PACKAGE_VERSION}) unstable; urgency=medium

  * Version ${CPACK_PACKAGE_VERSION}. CHANGELOG.md.gz in this folder lists the changes.

 -- ${CPACK_PACKAGE_CONTACT}  ${date}
")

file(GLOB compressed ${usr}/share/man/man*/* ${documents}/changelog ${documents}/CHANGELOG.md)
execute_process(COMMAND gzip -9n ${compressed} COMMAND_ERROR_IS_FATAL ANY)
