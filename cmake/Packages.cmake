# Packages: one for each component, of the kind that `cpack -G DEB` or `cpack -G RPM` names.
set(korva_packaging "${PROJECT_SOURCE_DIR}/packaging")

set(CPACK_PACKAGE_NAME korva-osstatus)
set(CPACK_PACKAGE_VENDOR "Korva")
set(CPACK_PACKAGE_CONTACT "Korva maintainers <maintainers@korva.example>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "CMPI provider for the operating system of a Linux host")
set(CPACK_PACKAGE_DIRECTORY "${CMAKE_BINARY_DIR}/packages")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_COMPONENTS_GROUPING ONE_PER_GROUP)
set(CPACK_COMPONENTS_ALL provider companion development)
if(KORVA_CMPIHOST)
    list(APPEND CPACK_COMPONENTS_ALL tools)
endif()
set(CPACK_PROJECT_CONFIG_FILE "${korva_packaging}/PackageProperties.cmake")

set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(CPACK_DEBIAN_PACKAGE_SECTION admin)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
if(KORVA_WORD_SIZE STREQUAL "32")
    set(CPACK_DEBIAN_PACKAGE_ARCHITECTURE i386)
endif()

set(CPACK_RPM_COMPONENT_INSTALL ON)
set(CPACK_RPM_FILE_NAME RPM-DEFAULT)
set(CPACK_RPM_PACKAGE_RELEASE 1)
set(CPACK_RPM_PACKAGE_RELOCATABLE OFF)
set(CPACK_RPM_SPEC_MORE_DEFINE "%define _build_id_links none")
set(CPACK_RPM_PACKAGE_GROUP "System Environment/Daemons")
set(CPACK_RPM_PACKAGE_LICENSE "LicenseRef-Korva")
if(KORVA_WORD_SIZE STREQUAL "32")
    set(CPACK_RPM_PACKAGE_ARCHITECTURE i686)
endif()

# What dpkg-shlibdeps finds, too; written down because it knows no library of another word size.
set(korva_own_release "${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE}")
set(korva_libraries "libc6 (>= 2.34)" "libgcc-s1 (>= 7)" "libstdc++6 (>= 11)")
set(korva_same_provider "korva-osstatus-provider (= ${korva_own_release})")

# korva_package(<component> <deb> <rpm> <summary> <description> <deb's dependency>...)
# Debian wants a copyright and a changelog of each package; they go to its group alone.
macro(korva_package component deb rpm summary description)
    string(TOUPPER ${component} key)
    set(CPACK_COMPONENT_${key}_GROUP ${component})
    set(CPACK_COMPONENT_DEBIAN-${key}_GROUP ${component})
    list(APPEND CPACK_COMPONENTS_ALL debian-${component})
    set(CPACK_COMPONENT_GROUP_${key}_DESCRIPTION "${description}")
    set(copyright "${korva_packaging}/debian/copyright")
    if(EXISTS "${copyright}.${component}")
        string(APPEND copyright ".${component}")
    endif()
    install(FILES "${korva_changelog}"
            DESTINATION "share/doc/${deb}" COMPONENT debian-${component} EXCLUDE_FROM_ALL)
    install(FILES "${copyright}" RENAME copyright
            DESTINATION "share/doc/${deb}" COMPONENT debian-${component} EXCLUDE_FROM_ALL)

    set(CPACK_DEBIAN_${key}_PACKAGE_NAME ${deb})
    set(CPACK_DEBIAN_${key}_DESCRIPTION "${summary}\n${description}")
    string(JOIN ", " CPACK_DEBIAN_${key}_PACKAGE_DEPENDS ${ARGN})
    file(GLOB scripts "${korva_packaging}/debian/${component}/*")
    set(CPACK_DEBIAN_${key}_PACKAGE_CONTROL_EXTRA "${scripts}")

    set(CPACK_RPM_${key}_PACKAGE_NAME ${rpm})
    set(CPACK_RPM_${key}_PACKAGE_SUMMARY "${summary}")
    set(CPACK_RPM_${key}_PACKAGE_DESCRIPTION "${description}")
endmacro()

set(korva_changelog "${CMAKE_BINARY_DIR}/generated/changelog.Debian.gz")
korva_gzip("${korva_packaging}/debian/changelog" "${korva_changelog}")
add_custom_target(korva_changelog ALL DEPENDS "${korva_changelog}")

korva_package(provider korva-osstatus-provider korva-osstatus-provider
    "CMPI provider for the operating system of a Linux host"
    "Lets a CIM object manager answer requests about the operating system of this
host: the system itself, its capabilities, and their associations with the
computer system. Holds the libraries of the agent's framework, the classes as
MOF, and the command that registers the provider."
    ${korva_libraries})
korva_package(companion korva-osstatus-companion korva-osstatus-companion
    "CMPI provider for the computer system of a Linux host"
    "Serves KORVA_ComputerSystem, the other end of the operating system's
associations, where no other provider of the object manager does."
    "${korva_same_provider}" ${korva_libraries})
korva_package(development korva-osstatus-dev korva-osstatus-devel
    "headers of the Korva agent framework"
    "Headers, library links, CMake package and pkg-config files for those who make
another agent of the framework's libraries: utilities for CMPI providers,
instrumentation of the host, log and trace."
    "${korva_same_provider}")
if(KORVA_CMPIHOST)
    korva_package(tools korva-osstatus-tools korva-osstatus-tools
        "embedded CIM host for one CMPI provider"
        "The command cmpihost loads a provider as an object manager does, runs one
operation on it and prints what it returns: for trying out a provider, for
tests and for looking at a host without an object manager."
        "${korva_same_provider}" ${korva_libraries})
endif()

set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_PROVIDER_PACKAGE_RECOMMENDS "libsystemd0")
set(CPACK_DEBIAN_PROVIDER_PACKAGE_SUGGESTS "korva-osstatus-companion, logrotate")
foreach(key COMPANION DEVELOPMENT TOOLS)
    set(CPACK_RPM_${key}_PACKAGE_REQUIRES "korva-osstatus-provider = ${PROJECT_VERSION}-1")
endforeach()
set(CPACK_RPM_PROVIDER_POST_UNINSTALL_SCRIPT_FILE "${korva_packaging}/rpm/provider/postun")
foreach(component provider companion)
    string(TOUPPER ${component} key)
    set(CPACK_RPM_${key}_POST_INSTALL_SCRIPT_FILE "${korva_packaging}/rpm/${component}/post")
    set(CPACK_RPM_${key}_PRE_UNINSTALL_SCRIPT_FILE "${korva_packaging}/rpm/${component}/preun")
endforeach()
set(CPACK_RPM_PROVIDER_USER_FILELIST "%config(noreplace) /etc/logrotate.d/korva-osstatus")
set(CPACK_RPM_EXCLUDE_FROM_AUTO_FILELIST_ADDITION
    /etc /etc/logrotate.d /usr/sbin "/usr/${CMAKE_INSTALL_LIBDIR}/cmake" "/usr/${CMAKE_INSTALL_LIBDIR}/pkgconfig"
    "/usr/${KORVA_CMPI_LIBDIR}" /usr/share/man /usr/share/man/man1 /usr/share/man/man5
    /usr/share/man/man7 /usr/share/man/man8)

include(CPack)
