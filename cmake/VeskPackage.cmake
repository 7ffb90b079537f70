# SPDX-License-Identifier: Apache-2.0
# vesk_install_library(TARGET DESCRIPTION text QT module... HEADERS file... [INCLUDE directory])
#
# Installs a library for other programs: itself, its headers below include/TARGET (INCLUDE: where they lie below it), and
# what finds it, for pkg-config (name TARGET) and CMake (package TARGET, target Vesk::TARGET). QT: modules of Qt that
# its headers need.
include(CMakePackageConfigHelpers)

function(vesk_install_library target)
    cmake_parse_arguments(ARG "" "DESCRIPTION;INCLUDE" "QT;HEADERS" ${ARGN})
    set(include_directory "${CMAKE_INSTALL_INCLUDEDIR}/${target}")
    set(cmake_directory "${CMAKE_INSTALL_LIBDIR}/cmake/${target}")

    install(TARGETS ${target} EXPORT ${target}
        LIBRARY DESTINATION "${CMAKE_INSTALL_LIBDIR}"
        ARCHIVE DESTINATION "${CMAKE_INSTALL_LIBDIR}")
    install(FILES ${ARG_HEADERS} DESTINATION "${include_directory}/${ARG_INCLUDE}")
    target_include_directories(${target} INTERFACE "$<INSTALL_INTERFACE:${include_directory}>")
    install(EXPORT ${target} NAMESPACE Vesk:: DESTINATION "${cmake_directory}" FILE ${target}Targets.cmake)

    # What the two templates say.
    get_target_property(output_name ${target} OUTPUT_NAME)
    if(NOT output_name)
        set(output_name ${target})
    endif()
    set(name ${target})
    set(description "${ARG_DESCRIPTION}")
    list(JOIN ARG_QT " " qt_components)
    list(TRANSFORM ARG_QT PREPEND "Qt5" OUTPUT_VARIABLE qt_modules)
    list(JOIN qt_modules ", " qt_modules)

    configure_file("${PROJECT_SOURCE_DIR}/packaging/library/library.pc.in" ${target}.pc @ONLY)
    configure_package_config_file("${PROJECT_SOURCE_DIR}/packaging/library/library-config.cmake.in"
        ${target}Config.cmake INSTALL_DESTINATION "${cmake_directory}" NO_SET_AND_CHECK_MACRO)
    write_basic_package_version_file(${target}ConfigVersion.cmake COMPATIBILITY SameMajorVersion)
    install(FILES "${CMAKE_CURRENT_BINARY_DIR}/${target}.pc" DESTINATION "${CMAKE_INSTALL_LIBDIR}/pkgconfig")
    install(FILES "${CMAKE_CURRENT_BINARY_DIR}/${target}Config.cmake"
                  "${CMAKE_CURRENT_BINARY_DIR}/${target}ConfigVersion.cmake"
            DESTINATION "${cmake_directory}")
endfunction()
