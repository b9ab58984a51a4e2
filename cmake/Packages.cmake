# Debian packages, by `cpack -G DEB`: one for each component. Those of other distributions are made by what
# packaging/rpm says.
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

# What dpkg-shlibdeps finds, too; written down because it knows no library of another word size.
set(korva_own_release "${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE}")
set(korva_libraries "libc6 (>= 2.34)" "libgcc-s1 (>= 7)" "libstdc++6 (>= 11)")
set(korva_same_provider "korva-osstatus-provider (= ${korva_own_release})")

# korva_package(<component> <deb> <summary> <description> <deb's dependency>...)
# Debian wants a copyright and a changelog of each package; they go to its group alone.
macro(korva_package component deb summary description)
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
endmacro()

set(korva_changelog "${CMAKE_BINARY_DIR}/generated/changelog.Debian.gz")
korva_gzip("${korva_packaging}/debian/changelog" "${korva_changelog}")
add_custom_target(korva_changelog ALL DEPENDS "${korva_changelog}")

korva_package(provider korva-osstatus-provider
    "CMPI provider for the operating system of a Linux host"
    "Lets a CIM object manager answer requests about the operating system of this
host: the system itself, its capabilities, and their associations with the
computer system. Holds the libraries of the agent's framework, the classes as
MOF, and the command that registers the provider."
    ${korva_libraries})
korva_package(companion korva-osstatus-companion
    "CMPI provider for the computer system of a Linux host"
    "Serves KORVA_ComputerSystem, the other end of the operating system's
associations, where no other provider of the object manager does."
    "${korva_same_provider}" ${korva_libraries})
korva_package(development korva-osstatus-dev
    "headers of the Korva agent framework"
    "Headers, library links, CMake package and pkg-config files for those who make
another agent of the framework's libraries: utilities for CMPI providers,
instrumentation of the host, log and trace."
    "${korva_same_provider}")
if(KORVA_CMPIHOST)
    korva_package(tools korva-osstatus-tools
        "embedded CIM host for one CMPI provider"
        "The command cmpihost loads a provider as an object manager does, runs one
operation on it and prints what it returns: for trying out a provider, for
tests and for looking at a host without an object manager."
        "${korva_same_provider}" ${korva_libraries})
endif()

set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_PROVIDER_PACKAGE_RECOMMENDS "libsystemd0")
set(CPACK_DEBIAN_PROVIDER_PACKAGE_SUGGESTS "korva-osstatus-companion, logrotate")
include(CPack)
