# What Debian wants of a package beyond the installed files. CPack runs this when each component is
# in a folder of its own, and before it makes the packages.

# Whatever a component is called, its documents lie in the folder of its package.
string(TIMESTAMP date "%a, %d %b %Y %H:%M:%S +0000" UTC)
foreach(component IN LISTS CPACK_COMPONENTS_ALL)
    string(TOUPPER ${component} upper)
    set(package ${CPACK_DEBIAN_${upper}_PACKAGE_NAME})
    set(root ${CPACK_TEMPORARY_DIRECTORY}/${component}/usr)
    set(docs ${root}/share/doc/${package})
    file(COPY ${CMAKE_CURRENT_LIST_DIR}/copyright DESTINATION ${docs})
    file(WRITE ${docs}/changelog.Debian
        "vetra (${CPACK_PACKAGE_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE}) unstable; urgency=medium\n\n"
        "  * Version ${CPACK_PACKAGE_VERSION}: see CHANGELOG.md of the source.\n\n"
        " -- ${CPACK_PACKAGE_CONTACT}  ${date}\n")
    file(GLOB pages ${root}/share/man/man*/*)
    execute_process(COMMAND gzip -9n ${docs}/changelog.Debian ${pages} COMMAND_ERROR_IS_FATAL ANY)
    if(EXISTS ${root}/share/zsh)
        file(RENAME ${root}/share/zsh/site-functions ${root}/share/zsh/vendor-completions)
    endif()
    # The tool finds the library in a system folder.
    file(GLOB programs ${root}/bin/*)
    foreach(program IN LISTS programs)
        file(RPATH_REMOVE FILE ${program})
    endforeach()
endforeach()
