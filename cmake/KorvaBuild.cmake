# How every target of the tree is compiled: language level, warnings, hardening, word size, sanitizers.

set(CMAKE_CXX_STANDARD 17)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_CXX_VISIBILITY_PRESET hidden)
set(CMAKE_VISIBILITY_INLINES_HIDDEN ON)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)

if(NOT CMAKE_BUILD_TYPE AND NOT CMAKE_CONFIGURATION_TYPES)
    set(CMAKE_BUILD_TYPE RelWithDebInfo CACHE STRING "Kind of build" FORCE)
endif()

set(CMAKE_LIBRARY_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/lib")
set(CMAKE_ARCHIVE_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/lib/static")
set(CMAKE_RUNTIME_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/bin")

math(EXPR korva_word_size "8 * ${CMAKE_SIZEOF_VOID_P}")
set(KORVA_WORD_SIZE "${korva_word_size}" CACHE STRING "Word size of everything that is built: 32 or 64")
set(KORVA_SANITIZE "" CACHE STRING "Value for -fsanitize=, empty for none")
option(KORVA_WERROR "Treat warnings as errors" OFF)
option(KORVA_UNITY "Compile the files of cmpihost as one, as those of each test program are" OFF)

include(CheckPIESupported)
check_pie_supported()

# Everything carries these: they change the binary interface or the whole program.
if(NOT KORVA_WORD_SIZE STREQUAL "${korva_word_size}")
    add_compile_options(-m${KORVA_WORD_SIZE})
    add_link_options(-m${KORVA_WORD_SIZE})
endif()
add_compile_definitions(_FILE_OFFSET_BITS=64 _TIME_BITS=64)
if(KORVA_SANITIZE)
    add_compile_options(-fsanitize=${KORVA_SANITIZE} -fno-sanitize-recover=all -fno-omit-frame-pointer)
    add_link_options(-fsanitize=${KORVA_SANITIZE})
    if(CMAKE_CXX_COMPILER_ID STREQUAL "Clang")
        # Functions that are looked up in a library by name have its types, opaque to the caller, and the
        # look at an object's type opens a pipe, which a process without free descriptors cannot.
        add_compile_options(-fno-sanitize=function,vptr)
        add_link_options(-fno-sanitize=function,vptr)
    endif()
else()
    add_compile_definitions($<$<NOT:$<CONFIG:Debug>>:_FORTIFY_SOURCE=2>)
endif()
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
    # A unique symbol would pin a library in the process after dlclose.
    add_compile_options($<$<COMPILE_LANGUAGE:CXX>:-fno-gnu-unique>)
endif()
# Everything is bound when it is loaded: calls need no stub that binds them later.
add_compile_options(-fstack-protector-strong -fno-plt)
add_link_options(-Wl,-z,relro -Wl,-z,now -Wl,-z,noexecstack)

# Options for the project's own code; a test framework built from source goes without.
add_library(korva_options INTERFACE)
add_library(korva::options ALIAS korva_options)
target_compile_options(korva_options INTERFACE
    -Wall -Wextra -Wpedantic -Wconversion
    # Among files that are compiled as one, a name of one shadows that of another.
    $<$<NOT:$<BOOL:${KORVA_UNITY}>>:-Wshadow>
    $<$<COMPILE_LANGUAGE:CXX>:-Wnon-virtual-dtor -Woverloaded-virtual>
    $<$<BOOL:${KORVA_WERROR}>:-Werror>)

# Shared libraries find their neighbours beside themselves, programs in ../lib.
function(korva_shared_library target)
    set_target_properties(${target} PROPERTIES
        VERSION 1.0.0 SOVERSION 1 BUILD_RPATH_USE_ORIGIN ON
        BUILD_WITH_INSTALL_RPATH ON INSTALL_RPATH "$ORIGIN")
    if(NOT KORVA_SANITIZE)
        target_link_options(${target} PRIVATE -Wl,--no-undefined)
    endif()
endfunction()

# A symbol list decides what a library exports: anything else stays inside.
function(korva_export_only target map)
    target_link_options(${target} PRIVATE "-Wl,--version-script=${map}")
    set_property(TARGET ${target} APPEND PROPERTY LINK_DEPENDS "${map}")
endfunction()

# korva_framework_library(<name> SOURCES ... [LIBRARIES ...]): the shared library lib<name>.so.1 that
# exports what exports.map lists, and <name>_static with the same code for unit tests of what it does
# not export. Each has its own copy of what it uses of base.
function(korva_framework_library name)
    cmake_parse_arguments(ARG "" "" "SOURCES;LIBRARIES" ${ARGN})
    add_library(${name}_objects OBJECT ${ARG_SOURCES})
    target_link_libraries(${name}_objects PRIVATE korva::options korva::base ${ARG_LIBRARIES})
    add_library(${name} SHARED $<TARGET_OBJECTS:${name}_objects>)
    add_library(${name}_static STATIC EXCLUDE_FROM_ALL $<TARGET_OBJECTS:${name}_objects>)
    foreach(library ${name} ${name}_static)
        add_library(korva::${library} ALIAS ${library})
        target_include_directories(${library} PUBLIC "$<BUILD_INTERFACE:${KORVA_CONTRACT_INCLUDE_DIR}>")
        target_link_libraries(${library} PUBLIC ${ARG_LIBRARIES} PRIVATE korva::base)
        target_compile_features(${library} PUBLIC cxx_std_17)
    endforeach()
    korva_shared_library(${name})
    korva_export_only(${name} "${CMAKE_CURRENT_SOURCE_DIR}/exports.map")
endfunction()
