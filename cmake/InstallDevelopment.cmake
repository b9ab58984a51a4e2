# What a maker of another agent needs: headers, a CMake package, pkg-config files.
include(CMakePackageConfigHelpers)

set(korva_include_dir "${CMAKE_INSTALL_INCLUDEDIR}/korva-osstatus")
install(DIRECTORY "${PROJECT_SOURCE_DIR}/include/" DESTINATION "${korva_include_dir}"
        COMPONENT development FILES_MATCHING PATTERN "*.h" PATTERN "cmpi" EXCLUDE)

# A distribution's CMPI headers stay where they are; ours keep out of their way.
set(korva_pkg_config_cmpi "")
if(KORVA_CMPI_INCLUDE_DIR STREQUAL "${PROJECT_SOURCE_DIR}/include")
    install(DIRECTORY "${PROJECT_SOURCE_DIR}/include/cmpi" DESTINATION "${korva_include_dir}"
            COMPONENT development FILES_MATCHING PATTERN "*.h")
elseif(NOT KORVA_CMPI_INCLUDE_DIR STREQUAL "/usr/include")
    set(korva_pkg_config_cmpi " -I${KORVA_CMPI_INCLUDE_DIR}")
endif()

# The headers of this tree serve this build only; whoever uses the package takes the installed ones.
set_target_properties(korva_cmpi PROPERTIES EXPORT_NAME cmpi)
foreach(target korva_cmpi ${KORVA_FRAMEWORK})
    get_target_property(folders ${target} INTERFACE_INCLUDE_DIRECTORIES)
    list(TRANSFORM folders REPLACE "^${PROJECT_SOURCE_DIR}/.*" "$<BUILD_INTERFACE:\\0>")
    set_target_properties(${target} PROPERTIES
        INTERFACE_INCLUDE_DIRECTORIES "${folders};$<INSTALL_INTERFACE:${korva_include_dir}>")
endforeach()
install(TARGETS korva_cmpi EXPORT KorvaFrameworkTargets)

set(korva_package_dir "${CMAKE_INSTALL_LIBDIR}/cmake/KorvaFramework")
set(korva_generated "${CMAKE_BINARY_DIR}/generated")
install(EXPORT KorvaFrameworkTargets NAMESPACE korva:: DESTINATION "${korva_package_dir}"
        COMPONENT development)
configure_package_config_file(
    "${PROJECT_SOURCE_DIR}/packaging/development/KorvaFrameworkConfig.cmake.in"
    "${korva_generated}/KorvaFrameworkConfig.cmake" INSTALL_DESTINATION "${korva_package_dir}")

# The version file compares word sizes, with that of the compiler and not of the libraries.
math(EXPR CMAKE_SIZEOF_VOID_P "${KORVA_WORD_SIZE} / 8")
write_basic_package_version_file("${korva_generated}/KorvaFrameworkConfigVersion.cmake"
                                 VERSION "${PROJECT_VERSION}" COMPATIBILITY SameMajorVersion)
unset(CMAKE_SIZEOF_VOID_P)
install(FILES "${korva_generated}/KorvaFrameworkConfig.cmake"
              "${korva_generated}/KorvaFrameworkConfigVersion.cmake"
        DESTINATION "${korva_package_dir}" COMPONENT development)

# korva_pkg_config(<library> <description> <further compiler flags>)
function(korva_pkg_config library description flags)
    file(RELATIVE_PATH up "/${CMAKE_INSTALL_LIBDIR}/pkgconfig" "/")
    string(REGEX REPLACE "/$" "" up "${up}")
    configure_file("${PROJECT_SOURCE_DIR}/packaging/development/library.pc.in"
                   "${korva_generated}/${library}.pc" @ONLY)
    install(FILES "${korva_generated}/${library}.pc"
            DESTINATION "${CMAKE_INSTALL_LIBDIR}/pkgconfig" COMPONENT development)
endfunction()

korva_pkg_config(vaprovider "Object paths, instances and monikers on any CMPI broker"
                 " -DCMPI_PLATFORM_LINUX_GENERIC_GNU${korva_pkg_config_cmpi}")
korva_pkg_config(vainstrumentation "Cursors over the managed nodes of a host" "")
korva_pkg_config(zblog "Log and trace of a management agent" "")

# Examples, to be copied: whole projects, which are built with the package.
install(DIRECTORY "${PROJECT_SOURCE_DIR}/examples/" DESTINATION "${KORVA_SHARE_DIR}/examples"
        COMPONENT development USE_SOURCE_PERMISSIONS)
