# Looks at the symbols of the sources that are compiled once per processor level. A weak symbol there
# could be merged with another level's copy of the same function, and a call of code from elsewhere
# could be to such a copy.
foreach(object IN LISTS OBJECTS)
    if(NOT object MATCHES "level_([a-z0-9]+)\\.cpp")
        continue()
    endif()
    set(level ${CMAKE_MATCH_1})
    string(APPEND levels " ${level}")
    execute_process(COMMAND ${NM} --extern-only ${object} OUTPUT_VARIABLE symbols
        COMMAND_ERROR_IS_FATAL ANY)
    string(REGEX MATCHALL "[A-Za-z] [^ \n]+" symbols "${symbols}")
    # Plain C functions of the C library's memory and mathematics may be called.
    list(FILTER symbols EXCLUDE REGEX "^U (mem[a-z]+|_GLOBAL_OFFSET_TABLE_|__stack_chk_fail)$")
    list(LENGTH symbols count)
    if(NOT count EQUAL 1 OR NOT symbols MATCHES "^[DR] _ZN.*${level}(7kStages|7kPasses|5kRows)E$")
        message(FATAL_ERROR "level ${level} has other symbols than its functions: ${symbols}")
    endif()
endforeach()
if(NOT levels)
    message(FATAL_ERROR "no level was looked at")
endif()
message(STATUS "levels:${levels}")
