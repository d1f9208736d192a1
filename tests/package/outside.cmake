# Using an installed tree as other projects do.

function(run)
    execute_process(COMMAND ${ARGN} COMMAND_ERROR_IS_FATAL ANY)
endfunction()

# Builds a project that finds the library with find_package.
function(build_outside source build prefix)
    run(${CMAKE_COMMAND} -S ${source} -B ${build} -G ${GENERATOR}
        -DCMAKE_CXX_COMPILER=${CXX} -DCMAKE_PREFIX_PATH=${prefix} -DCMAKE_BUILD_TYPE=Debug)
    run(${CMAKE_COMMAND} --build ${build})
endfunction()

# Builds a program with the flags that pkg-config gives, if there is pkg-config, and runs it.
function(run_by_pkg_config source program prefix)
    find_program(pkg_config pkg-config)
    if(NOT pkg_config)
        return()
    endif()
    if(NOT SHARED_LIBRARY)
        set(static --static)
    endif()
    set(ENV{PKG_CONFIG_PATH} ${prefix}/${LIB_DIR}/pkgconfig)
    execute_process(COMMAND ${pkg_config} --define-variable=prefix=${prefix} --cflags --libs ${static}
        "vetra = ${VERSION}" OUTPUT_VARIABLE flags COMMAND_ERROR_IS_FATAL ANY)
    separate_arguments(flags UNIX_COMMAND "${flags}")
    run(${CXX} -std=c++17 ${source} -o ${program} ${flags})
    set(ENV{LD_LIBRARY_PATH} ${prefix}/${LIB_DIR})
    run(${program})
endfunction()
