# Makes the Debian packages, unpacks them into an empty root, and uses the library and the tool from
# there.

include(${CMAKE_CURRENT_LIST_DIR}/outside.cmake)

set(root ${WORK_DIR}/root)
set(prefix ${root}/usr)
file(REMOVE_RECURSE ${WORK_DIR})
run(${CPACK} -G DEB -C ${CONFIG} --config ${BUILD_DIR}/CPackConfig.cmake -B ${WORK_DIR}/packages)
file(GLOB packages ${WORK_DIR}/packages/*.deb)

# What each package must depend on: among others the libraries that its programs are linked to.
set(needs_library "libc6 " "libgomp1 " "libstdc\\+\\+6 ")
set(needs_tools ${needs_library} "libgdal[0-9]+ ")
if(SHARED_LIBRARY)
    set(library_package "libvetra[0-9.]+ \\(= ${VERSION}-1\\)")
    set(needs_dev ${library_package})
    list(APPEND needs_tools ${library_package})
endif()
foreach(package IN LISTS packages)
    foreach(field IN ITEMS Package Version Depends)
        execute_process(COMMAND dpkg-deb --field ${package} ${field} OUTPUT_VARIABLE ${field}
            OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
    endforeach()
    string(REGEX MATCH "dev$|tools$" kind ${Package})
    if(NOT kind)
        set(kind library)
    endif()
    list(APPEND kinds ${kind})
    foreach(need IN LISTS needs_${kind})
        if(NOT Depends MATCHES "${need}" OR NOT Version STREQUAL "${VERSION}-1")
            message(SEND_ERROR "${Package} ${Version} depends on: ${Depends}, not on ${need}")
        endif()
    endforeach()
    run(dpkg-deb --extract ${package} ${root})
endforeach()
list(SORT kinds)
if(NOT kinds STREQUAL "dev;library;tools" AND NOT (kinds STREQUAL "dev;tools" AND NOT SHARED_LIBRARY))
    message(SEND_ERROR "The packages are: ${packages}")
endif()

build_outside(${EXAMPLES_DIR} ${WORK_DIR}/examples ${prefix})
set(ENV{LD_LIBRARY_PATH} ${prefix}/${LIB_DIR})
run(${CMAKE_CTEST_COMMAND} --test-dir ${WORK_DIR}/examples --no-tests=error --output-on-failure)
run_by_pkg_config(${EXAMPLES_DIR}/blocks.cpp ${WORK_DIR}/pkg_config_blocks ${prefix})

# The tool: a picture whose right half is white, made twice as large with an installed kernel file.
file(READ_ELF ${prefix}/bin/vetra RPATH rpath RUNPATH runpath)
if(NOT "${rpath}${runpath}" STREQUAL "")
    message(SEND_ERROR "The tool looks for libraries in ${rpath}${runpath}")
endif()
string(REPEAT "0 0 0 0 255 255 255 255\n" 8 pixels)
file(WRITE ${WORK_DIR}/half.asc "ncols 8\nnrows 8\nxllcorner 0\nyllcorner 0\ncellsize 1\n${pixels}")
run(${prefix}/bin/vetra resample -q ${WORK_DIR}/half.asc ${WORK_DIR}/large.asc --scale 2
    --method KERNEL,FILE=${prefix}/share/vetra/kernels/cubic-0.5.txt,FILL=NN)
file(STRINGS ${WORK_DIR}/large.asc row LIMIT_COUNT 1 REGEX "^ *0 0 0 .* 255 255 255 *$")
if(NOT row)
    file(READ ${WORK_DIR}/large.asc text)
    message(SEND_ERROR "The installed tool made of half.asc:\n${text}")
endif()

find_program(lintian lintian)
if(lintian)
    # The packages aren't uploaded to Debian, and CPack writes scripts that call ldconfig although
    # there is a trigger.
    run(${lintian} --fail-on error,warning --allow-root
        --suppress-tags initial-upload-closes-no-bugs,maintscript-calls-ldconfig ${packages})
endif()
