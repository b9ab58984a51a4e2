# Builds what is linked by object managers with a distribution's headers, as somebody would who has them.
#   cmake -DSOURCE=<project> -DBUILD=<folder> [-D<variable of the project>=<value>]... -P build.cmake
cmake_minimum_required(VERSION 3.25)

function(run)
    execute_process(COMMAND ${ARGV} OUTPUT_VARIABLE output ERROR_VARIABLE output RESULT_VARIABLE result)
    if(NOT result EQUAL 0)
        message(FATAL_ERROR "${output}")
    endif()
    set(output "${output}" PARENT_SCOPE)
endfunction()

set(usr "${BUILD}/usr")  # where the distribution has its headers
run("${CMAKE_COMMAND}" -DFROM=${SOURCE}/include/cmpi -DTO=${usr}/include/cmpi
    -P "${CMAKE_CURRENT_LIST_DIR}/headers.cmake")
run("${CMAKE_COMMAND}" -S "${SOURCE}" -B "${BUILD}" -G Ninja -DCMAKE_PREFIX_PATH=${usr}
    -DCMAKE_C_COMPILER=${C} -DCMAKE_CXX_COMPILER=${CXX} -DCMAKE_BUILD_TYPE=None
    -DKORVA_WORD_SIZE=${WORD_SIZE} -DKORVA_WERROR=ON -DBUILD_TESTING=OFF -DKORVA_CMPIHOST=OFF)
if(NOT output MATCHES "CMPI headers: ${usr}/include/cmpi")
    message(FATAL_ERROR "not with the distribution's headers: ${output}")
endif()
run("${CMAKE_COMMAND}" --build "${BUILD}" --target
    korvaosstatusfacade korzbosstatusprofileprovider korvacomputersystemprovider)
