# GTest::gmock and its like: an installed package where there is one for the word size of what is built,
# else compiled from the source that distributions ship.

# The package's version file compares word sizes, with that of the compiler and not of what is built.
function(korva_find_googletest_package)
    math(EXPR CMAKE_SIZEOF_VOID_P "${KORVA_WORD_SIZE} / 8")
    if(KORVA_WORD_SIZE STREQUAL "32")
        string(REGEX REPLACE "^x86_64-" "i386-" CMAKE_LIBRARY_ARCHITECTURE "${CMAKE_LIBRARY_ARCHITECTURE}")
    endif()
    find_package(GTest CONFIG QUIET)
endfunction()

# A sanitizer sees what happens in code that it was compiled into.
if(NOT KORVA_SANITIZE)
    korva_find_googletest_package()
endif()
if(TARGET GTest::gmock_main)
    message(STATUS "GoogleTest: package in ${GTest_DIR}")
    return()
endif()

set(KORVA_GOOGLETEST_SOURCE /usr/src/googletest CACHE PATH "Source of GoogleTest, used where no package fits")
if(NOT EXISTS "${KORVA_GOOGLETEST_SOURCE}/CMakeLists.txt")
    message(FATAL_ERROR "GoogleTest is missing: install it as a package of this word size or as source "
        "(Debian: googletest), name its source with -DKORVA_GOOGLETEST_SOURCE=<folder>, or leave the tests "
        "out with -DBUILD_TESTING=OFF")
endif()
message(STATUS "GoogleTest: source in ${KORVA_GOOGLETEST_SOURCE}")
set(INSTALL_GTEST OFF CACHE BOOL "" FORCE)
add_subdirectory("${KORVA_GOOGLETEST_SOURCE}" "${CMAKE_BINARY_DIR}/googletest" EXCLUDE_FROM_ALL)
foreach(library gtest gtest_main gmock gmock_main)
    target_compile_options(${library} PRIVATE ${KORVA_TEST_OPTIONS} -U_FORTIFY_SOURCE)
endforeach()
