# What `cmake --install` puts where. Components: provider (the provider, the framework's libraries,
# schema and registration), companion, development, tools. Install*.cmake hold one subject each.

set(KORVA_SHARE_DIR share/korva-osstatus)

# Object managers look into a folder "cmpi" beside the system's libraries.
set(korva_cmpi_libdir_default lib/cmpi)
if(CMAKE_INSTALL_LIBDIR MATCHES "^lib(32|64)$")
    set(korva_cmpi_libdir_default "${CMAKE_INSTALL_LIBDIR}/cmpi")
endif()
set(KORVA_CMPI_LIBDIR "${korva_cmpi_libdir_default}"
    CACHE STRING "Folder that object managers load providers from, relative to the prefix")

include(InstallLibraries)
include(InstallDevelopment)
include(InstallRegistration)
include(InstallDocuments)
