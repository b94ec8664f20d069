cmake_minimum_required(VERSION 3.25)
# Fails unless a program that includes vexmap/dewarp.h alone compiles as C99 and as C++17 with
# every warning an error, and unless the header pulls in nothing but the public set (dewarp.h,
# dewarp_types.h, version.h) and the standard library: no engine header, no Boost.
set(public_headers dewarp.h dewarp_types.h version.h)
file(MAKE_DIRECTORY ${WORK_DIR})
file(WRITE ${WORK_DIR}/dewarp_alone.c "#include <vexmap/dewarp.h>\nint main(void) { return 0; }\n")
file(WRITE ${WORK_DIR}/dewarp_alone.cpp "#include <vexmap/dewarp.h>\nint main() { return 0; }\n")
foreach(language c cpp)
    if(language STREQUAL "c")
        set(command ${C_COMPILER} -std=c99)
    else()
        set(command ${CXX_COMPILER} -std=c++17 -Wold-style-cast)
    endif()
    # -H lists every header included, one a line, behind dots that give its depth.
    execute_process(COMMAND ${command} -pedantic-errors -Wall -Wextra -Wconversion -Werror -H
                            -fsyntax-only -I${SOURCE_DIR}/include -I${BINARY_DIR}/include
                            ${WORK_DIR}/dewarp_alone.${language}
                    RESULT_VARIABLE status ERROR_VARIABLE listing)
    if(NOT status EQUAL 0)
        message(FATAL_ERROR "vexmap/dewarp.h does not compile alone as ${language}:\n${listing}")
    endif()
    string(REGEX MATCHALL "(^|\n)\\.+ [^\n]+" included "${listing}")
    foreach(line IN LISTS included)
        string(REGEX REPLACE "^\n?\\.+ " "" header "${line}")
        get_filename_component(name ${header} NAME)
        if(header MATCHES "boost")
            message(FATAL_ERROR "vexmap/dewarp.h pulls in Boost (${header}) as ${language}")
        endif()
        if(header MATCHES "vexmap/[^/]+$" AND NOT name IN_LIST public_headers)
            message(FATAL_ERROR "vexmap/dewarp.h pulls in ${header} as ${language}")
        endif()
    endforeach()
endforeach()
