# What `cmake --install` ships, in three components (all by default):
#   runtime      libvexmap.so.1, the plug-in, the host tool, its manual page and the README
#   development  the C headers, libvexmap.so, the CMake package and vexmap.pc
#   engine       the static engine, its C++ headers and its part of the CMake package
# Every path in the package is relative to where it lies, so the prefix can be moved.
include(CMakePackageConfigHelpers)

set(VEXMAP_CMAKE_INSTALL_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/vexmap)
set(VEXMAP_PLUGIN_INSTALL_DIR ${CMAKE_INSTALL_LIBDIR}/vexmap)
set(VEXMAP_PLUGIN_INSTALL_FILE ${VEXMAP_PLUGIN_INSTALL_DIR}/libvexmap_dewarp.so)
set(VEXMAP_PUBLIC_HEADERS include/vexmap/dewarp.h include/vexmap/dewarp_types.h
                          ${PROJECT_BINARY_DIR}/include/vexmap/version.h)

install(TARGETS vexmap_shared EXPORT vexmapTargets
        LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT runtime
                NAMELINK_COMPONENT development)
install(TARGETS vexmap_dewarp
        LIBRARY DESTINATION ${VEXMAP_PLUGIN_INSTALL_DIR} COMPONENT runtime
        NAMELINK_SKIP)
install(FILES ${VEXMAP_PUBLIC_HEADERS} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/vexmap
        COMPONENT development)
install(FILES README.md DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT runtime)

install(TARGETS vexmap_engine EXPORT vexmapEngineTargets
        ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT engine)
install(DIRECTORY include/vexmap DESTINATION ${CMAKE_INSTALL_INCLUDEDIR} COMPONENT engine
        FILES_MATCHING PATTERN "*.h"
        PATTERN "dewarp.h" EXCLUDE PATTERN "dewarp_types.h" EXCLUDE)

install(EXPORT vexmapTargets NAMESPACE vexmap:: DESTINATION ${VEXMAP_CMAKE_INSTALL_DIR}
        COMPONENT development)
install(EXPORT vexmapEngineTargets NAMESPACE vexmap:: DESTINATION ${VEXMAP_CMAKE_INSTALL_DIR}
        COMPONENT engine)
configure_package_config_file(cmake/vexmapConfig.cmake.in
                              ${PROJECT_BINARY_DIR}/package/vexmapConfig.cmake
                              INSTALL_DESTINATION ${VEXMAP_CMAKE_INSTALL_DIR}
                              PATH_VARS VEXMAP_PLUGIN_INSTALL_FILE)
write_basic_package_version_file(${PROJECT_BINARY_DIR}/package/vexmapConfigVersion.cmake
                                 COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_BINARY_DIR}/package/vexmapConfig.cmake
              ${PROJECT_BINARY_DIR}/package/vexmapConfigVersion.cmake
        DESTINATION ${VEXMAP_CMAKE_INSTALL_DIR} COMPONENT development)

file(RELATIVE_PATH VEXMAP_PKGCONFIG_TO_PREFIX "/${CMAKE_INSTALL_LIBDIR}/pkgconfig" "/")
string(REGEX REPLACE "/$" "" VEXMAP_PKGCONFIG_TO_PREFIX "${VEXMAP_PKGCONFIG_TO_PREFIX}")
configure_file(cmake/vexmap.pc.in ${PROJECT_BINARY_DIR}/package/vexmap.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/package/vexmap.pc
        DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)

if(VEXMAP_BUILD_TOOLS)
    install(TARGETS vexmap RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT runtime)
    # The manual page is the tool's own --help, so the two cannot disagree.
    find_program(HELP2MAN help2man)
    if(HELP2MAN)
        add_custom_command(
            OUTPUT ${PROJECT_BINARY_DIR}/vexmap.1
            COMMAND ${HELP2MAN} --no-info --no-discard-stderr
                    --name "dewarp fisheye pictures and streams through the vexmap plug-in"
                    --include ${PROJECT_SOURCE_DIR}/tools/vexmap.h2m
                    --output ${PROJECT_BINARY_DIR}/vexmap.1 $<TARGET_FILE:vexmap>
            DEPENDS vexmap vexmap_dewarp ${PROJECT_SOURCE_DIR}/tools/vexmap.h2m
            COMMENT "Writing the manual page of vexmap")
        add_custom_target(vexmap_manual ALL DEPENDS ${PROJECT_BINARY_DIR}/vexmap.1)
        install(FILES ${PROJECT_BINARY_DIR}/vexmap.1 DESTINATION ${CMAKE_INSTALL_MANDIR}/man1
                COMPONENT runtime)
    else()
        message(STATUS "help2man not found: vexmap is installed without its manual page")
    endif()
endif()
