cmake_minimum_required(VERSION 3.25)
# Installs the build into a prefix, moves the prefix elsewhere, and builds and runs the example
# against it twice, once found by CMake's find_package and once by pkg-config; then runs the
# installed host tool. Fails at the first step that does not hold.
# Given: BUILD_DIR, SOURCE_DIR, WORK_DIR, GENERATOR, C_COMPILER, CXX_COMPILER, PKG_CONFIG, the
# install folders LIBDIR, BINDIR, INCLUDEDIR, MANDIR, DOCDIR, and MANUAL (whether a manual page is
# built).

function(run description)
    cmake_parse_arguments(ARG "" "OUTPUT;WORKING_DIRECTORY" "COMMAND" ${ARGN})
    if(NOT ARG_WORKING_DIRECTORY)
        set(ARG_WORKING_DIRECTORY ${WORK_DIR})
    endif()
    execute_process(COMMAND ${ARG_COMMAND} WORKING_DIRECTORY ${ARG_WORKING_DIRECTORY}
                    RESULT_VARIABLE status OUTPUT_VARIABLE output ERROR_VARIABLE errors)
    if(NOT status EQUAL 0)
        list(JOIN ARG_COMMAND " " command)
        message(FATAL_ERROR "${description} failed (${status}): ${command}\n${output}${errors}")
    endif()
    if(ARG_OUTPUT)
        set(${ARG_OUTPUT} "${output}" PARENT_SCOPE)
    endif()
endfunction()

file(REMOVE_RECURSE ${WORK_DIR})
file(MAKE_DIRECTORY ${WORK_DIR})
run("install" COMMAND ${CMAKE_COMMAND} --install ${BUILD_DIR} --prefix ${WORK_DIR}/installed)
# A relocatable package works wherever its prefix is put.
set(prefix ${WORK_DIR}/moved/prefix)
file(MAKE_DIRECTORY ${WORK_DIR}/moved)
file(RENAME ${WORK_DIR}/installed ${prefix})

set(expected_files
    ${LIBDIR}/libvexmap.so.${VERSION} ${LIBDIR}/libvexmap.so.${VERSION_MAJOR} ${LIBDIR}/libvexmap.so
    ${LIBDIR}/libvexmap_engine.a ${LIBDIR}/vexmap/libvexmap_dewarp.so
    ${INCLUDEDIR}/vexmap/dewarp.h ${INCLUDEDIR}/vexmap/dewarp_types.h
    ${INCLUDEDIR}/vexmap/version.h ${INCLUDEDIR}/vexmap/channel.h
    ${LIBDIR}/cmake/vexmap/vexmapConfig.cmake ${LIBDIR}/cmake/vexmap/vexmapConfigVersion.cmake
    ${LIBDIR}/pkgconfig/vexmap.pc ${BINDIR}/vexmap ${DOCDIR}/README.md)
if(MANUAL)
    list(APPEND expected_files ${MANDIR}/man1/vexmap.1)
endif()
foreach(file IN LISTS expected_files)
    if(NOT EXISTS ${prefix}/${file})
        message(FATAL_ERROR "the install has no ${file}")
    endif()
endforeach()
file(GLOB_RECURSE installed RELATIVE ${prefix} ${prefix}/*)
foreach(file IN LISTS installed)
    if(file MATCHES "standin|_test|_bench|_fuzz|view_gallery")
        message(FATAL_ERROR "the install holds ${file}, which is the build's own")
    endif()
endforeach()

# The engine's C++ headers are installed whole: together they compile with nothing but the prefix
# and Boost.
file(GLOB headers RELATIVE ${prefix}/${INCLUDEDIR} ${prefix}/${INCLUDEDIR}/vexmap/*.h)
set(all_headers "")
foreach(header IN LISTS headers)
    string(APPEND all_headers "#include <${header}>\n")
endforeach()
file(WRITE ${WORK_DIR}/all_headers.cpp "${all_headers}")
run("compiling every installed header"
    COMMAND ${CXX_COMPILER} -std=c++17 -fsyntax-only -I${prefix}/${INCLUDEDIR}
            ${WORK_DIR}/all_headers.cpp)

# The installed tool finds the installed plug-in from its own place.
run("vexmap --version" COMMAND ${prefix}/${BINDIR}/vexmap --version OUTPUT version_line)
if(NOT version_line STREQUAL "vexmap ${VERSION}\n")
    message(FATAL_ERROR "vexmap --version printed '${version_line}'")
endif()
run("the installed tool" COMMAND ${prefix}/${BINDIR}/vexmap --quiet --submode 1
                                 --output ${WORK_DIR}/view.png)
if(NOT EXISTS ${WORK_DIR}/view.png)
    message(FATAL_ERROR "the installed tool wrote no picture")
endif()

# find_package: the example against the shared library and against the static engine.
run("configuring the example with find_package"
    COMMAND ${CMAKE_COMMAND} -S ${SOURCE_DIR}/examples -B ${WORK_DIR}/example -G ${GENERATOR}
            -DCMAKE_C_COMPILER=${C_COMPILER} -DCMAKE_CXX_COMPILER=${CXX_COMPILER}
            -DCMAKE_BUILD_TYPE=Release -DCMAKE_PREFIX_PATH=${prefix}
            "-DCMAKE_C_FLAGS=-Wall -Wextra -pedantic -Werror")
run("building the example with find_package" COMMAND ${CMAKE_COMMAND} --build ${WORK_DIR}/example)
run("the example built with find_package" COMMAND ${WORK_DIR}/example/dewarp_one_frame
                                                  ${WORK_DIR}/view.pgm
    OUTPUT with_find_package)
if(NOT with_find_package MATCHES "^vexmap ${VERSION}: 640x480 view at pan 45.0, tilt 30.0, ")
    message(FATAL_ERROR "the example printed '${with_find_package}'")
endif()
if(NOT EXISTS ${WORK_DIR}/view.pgm)
    message(FATAL_ERROR "the example wrote no picture")
endif()
run("the example linked with the static engine"
    COMMAND ${WORK_DIR}/example/dewarp_one_frame_static OUTPUT with_static_engine)
if(NOT with_static_engine STREQUAL with_find_package)
    message(FATAL_ERROR "static '${with_static_engine}', shared '${with_find_package}'")
endif()

# pkg-config, as a Makefile would use it.
set(ENV{PKG_CONFIG_PATH} ${prefix}/${LIBDIR}/pkgconfig)
run("pkg-config" COMMAND ${PKG_CONFIG} --modversion vexmap OUTPUT pc_version)
if(NOT pc_version STREQUAL "${VERSION}\n")
    message(FATAL_ERROR "pkg-config gives version '${pc_version}'")
endif()
run("pkg-config" COMMAND ${PKG_CONFIG} --variable=plugin vexmap OUTPUT pc_plugin)
string(STRIP "${pc_plugin}" pc_plugin)
if(NOT EXISTS ${pc_plugin})
    message(FATAL_ERROR "pkg-config names the plug-in '${pc_plugin}', which is not there")
endif()
run("pkg-config" COMMAND ${PKG_CONFIG} --cflags --libs vexmap OUTPUT pc_flags)
separate_arguments(pc_flags UNIX_COMMAND "${pc_flags}")
run("building the example with pkg-config"
    COMMAND ${C_COMPILER} -std=c99 -Wall -Wextra -pedantic -Werror
            ${SOURCE_DIR}/examples/dewarp_one_frame.c ${pc_flags}
            -o ${WORK_DIR}/dewarp_one_frame_pkg_config)
set(ENV{LD_LIBRARY_PATH} ${prefix}/${LIBDIR})
run("the example built with pkg-config" COMMAND ${WORK_DIR}/dewarp_one_frame_pkg_config
    OUTPUT with_pkg_config)
if(NOT with_pkg_config STREQUAL with_find_package)
    message(FATAL_ERROR "pkg-config '${with_pkg_config}', find_package '${with_find_package}'")
endif()
message(STATUS "${with_find_package}")
