# CMPI headers: the system's where it has them, else those of include/cmpi.
find_path(KORVA_CMPI_INCLUDE_DIR NAMES cmpi/cmpidt.h DOC "Folder that holds cmpi/cmpidt.h")
if(NOT KORVA_CMPI_INCLUDE_DIR)
    set(KORVA_CMPI_INCLUDE_DIR "${PROJECT_SOURCE_DIR}/include" CACHE PATH "" FORCE)
endif()
message(STATUS "CMPI headers: ${KORVA_CMPI_INCLUDE_DIR}/cmpi")

add_library(korva_cmpi INTERFACE)
add_library(korva::cmpi ALIAS korva_cmpi)
# The contract's headers lie beside cmpi/: where the system's are used, they are reached through links
# in a folder of their own, or the project's cmpi/ would be found first.
if(KORVA_CMPI_INCLUDE_DIR STREQUAL "${PROJECT_SOURCE_DIR}/include")
    set(KORVA_CONTRACT_INCLUDE_DIR "${PROJECT_SOURCE_DIR}/include")
    target_include_directories(korva_cmpi INTERFACE "${KORVA_CMPI_INCLUDE_DIR}")
else()
    set(KORVA_CONTRACT_INCLUDE_DIR "${CMAKE_BINARY_DIR}/include")
    file(MAKE_DIRECTORY "${KORVA_CONTRACT_INCLUDE_DIR}")
    file(GLOB contract_headers RELATIVE "${PROJECT_SOURCE_DIR}/include" "${PROJECT_SOURCE_DIR}/include/*.h")
    foreach(header IN LISTS contract_headers)
        file(CREATE_LINK "${PROJECT_SOURCE_DIR}/include/${header}"
             "${KORVA_CONTRACT_INCLUDE_DIR}/${header}" SYMBOLIC)
    endforeach()
    target_include_directories(korva_cmpi SYSTEM INTERFACE "${KORVA_CMPI_INCLUDE_DIR}")
endif()
target_include_directories(korva_options INTERFACE "${KORVA_CONTRACT_INCLUDE_DIR}")
target_compile_definitions(korva_cmpi INTERFACE CMPI_PLATFORM_LINUX_GENERIC_GNU)

# The embedded broker fills every slot of its tables, and so knows what slots there are: it is compiled
# with the headers of include/cmpi alone. Their layout is the same.
add_library(korva_own_cmpi INTERFACE)
add_library(korva::own_cmpi ALIAS korva_own_cmpi)
target_include_directories(korva_own_cmpi INTERFACE "${PROJECT_SOURCE_DIR}/include")
target_compile_definitions(korva_own_cmpi INTERFACE CMPI_PLATFORM_LINUX_GENERIC_GNU)
