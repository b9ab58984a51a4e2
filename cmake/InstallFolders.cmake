# Where things go below the prefix: CMAKE_INSTALL_LIBDIR and its like. CMake derives the folder of the
# libraries from the compiler, which knows nothing of -m32; so it is told the word size of what is built.
set(korva_compiler_architecture "${CMAKE_LIBRARY_ARCHITECTURE}")
set(korva_compiler_pointer_size "${CMAKE_SIZEOF_VOID_P}")

math(EXPR CMAKE_SIZEOF_VOID_P "${KORVA_WORD_SIZE} / 8")
if(KORVA_WORD_SIZE STREQUAL "32")
    string(REGEX REPLACE "^x86_64-" "i386-" CMAKE_LIBRARY_ARCHITECTURE
           "${CMAKE_LIBRARY_ARCHITECTURE}")
endif()

include(GNUInstallDirs)

set(CMAKE_LIBRARY_ARCHITECTURE "${korva_compiler_architecture}")
set(CMAKE_SIZEOF_VOID_P "${korva_compiler_pointer_size}")

# Object managers look into a folder "cmpi" beside the system's libraries, which has no part that names
# an architecture.
set(korva_cmpi_libdir_default lib/cmpi)
if(CMAKE_INSTALL_LIBDIR MATCHES "^lib(32|64)$")
    set(korva_cmpi_libdir_default "${CMAKE_INSTALL_LIBDIR}/cmpi")
endif()
set(KORVA_CMPI_LIBDIR "${korva_cmpi_libdir_default}"
    CACHE STRING "Folder that object managers load providers from, relative to the prefix")
set(KORVA_MANAGER_LIBDIR "${KORVA_CMPI_LIBDIR}" CACHE STRING
    "Folder that object managers are pointed to, where links in it lead to KORVA_CMPI_LIBDIR")
