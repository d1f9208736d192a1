# Installs the build into a scratch folder and uses it from there: find_package, pkg-config, every
# header alone. Then looks at what the shared library exports.

function(run)
    execute_process(COMMAND ${ARGN} COMMAND_ERROR_IS_FATAL ANY)
endfunction()

set(prefix ${WORK_DIR}/prefix)
file(REMOVE_RECURSE ${WORK_DIR})
run(${CMAKE_COMMAND} --install ${BUILD_DIR} --prefix ${prefix} --config ${CONFIG})
run(${CMAKE_COMMAND} -S ${SOURCE_DIR} -B ${WORK_DIR}/build -G ${GENERATOR}
    -DCMAKE_CXX_COMPILER=${CXX} -DCMAKE_PREFIX_PATH=${prefix} -DCMAKE_BUILD_TYPE=Debug)
run(${CMAKE_COMMAND} --build ${WORK_DIR}/build)
file(GLOB programs ${WORK_DIR}/build/*consumer)
foreach(program IN LISTS programs)
    run(${program})
endforeach()

find_program(pkg_config pkg-config)
if(pkg_config)
    if(NOT SHARED_LIBRARY)
        set(static --static)
    endif()
    set(ENV{PKG_CONFIG_PATH} ${prefix}/${LIB_DIR}/pkgconfig)
    execute_process(COMMAND ${pkg_config} --define-variable=prefix=${prefix} --cflags --libs ${static}
        "vetra = ${VERSION}" OUTPUT_VARIABLE flags COMMAND_ERROR_IS_FATAL ANY)
    separate_arguments(flags UNIX_COMMAND "${flags}")
    run(${CXX} -std=c++17 ${SOURCE_DIR}/consumer.cpp -o ${WORK_DIR}/pkg_config_consumer ${flags})
    set(ENV{LD_LIBRARY_PATH} ${prefix}/${LIB_DIR})
    run(${WORK_DIR}/pkg_config_consumer)
endif()

if(SHARED_LIBRARY)
    execute_process(COMMAND ${NM} -D --defined-only ${SHARED_LIBRARY} OUTPUT_VARIABLE symbols
        COMMAND_ERROR_IS_FATAL ANY)
    string(REGEX MATCHALL "[A-Za-z] _?[^ \n]+" symbols "${symbols}")
    # Mangled names: the namespace vetra without its private part, the global functions and
    # classes, and weak instances of the standard library's templates.
    set(functions "FormatString|ChooseResampleMode|ChooseResampleModeForFilter")
    string(APPEND functions "|TrimWhitespace|IsNumeric|TextToDouble|CollapseWhitespace|ToLower|ToUpper|Strip")
    string(APPEND functions "|CountChar|FindAndReplace|HashString|NumDigits|TokenizeString")
    set(classes "22CaseInsensitiveCompare|10ITokenizer|15StringTokenizer")
    set(public "[A-Z] _Z(T[VIS])?NK?5vetra|T _Z[0-9]+(${functions})[a-zA-Z]")
    string(APPEND public "|[A-Z] _Z(T[VIS])?(NK?)?(${classes})")
    set(standard "[WVu] _ZZ?(T[VIS])?(NK?)?(St|S[abdios]|9__gnu_cxx)")
    foreach(symbol IN LISTS symbols)
        if(NOT symbol MATCHES "^(${public}|${standard})" OR symbol MATCHES "6engine|_GLOBAL__N_")
            list(APPEND foreign ${symbol})
        endif()
    endforeach()
    if(foreign)
        list(JOIN foreign "\n  " foreign)
        message(FATAL_ERROR "The shared library exports names that are not public:\n  ${foreign}")
    endif()
    list(LENGTH symbols count)
    if(count LESS 100)
        message(FATAL_ERROR "Only ${count} names were found in the shared library")
    endif()
endif()
