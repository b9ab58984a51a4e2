# A running endpoint under load.
add_executable(endpoint_load EndpointLoad.cpp EndpointClients.cpp)
set_target_properties(endpoint_load PROPERTIES UNITY_BUILD OFF)
target_link_libraries(endpoint_load PRIVATE korva_endpoint_process korva::options)
add_dependencies(endpoint_load
    cmpihost-serve korva_fixture_instrumentation korvaosstatusfacade korzbosstatusprofileprovider
    korvacomputersystemprovider)

# korva_endpoint_load(<name> <option>...): a load is one test.
function(korva_endpoint_load name)
    add_test(NAME load.${name}
        COMMAND "${CMAKE_CURRENT_SOURCE_DIR}/run" $<TARGET_FILE:endpoint_load>
            $<TARGET_FILE:cmpihost-serve> ${ARGN})
    set_tests_properties(load.${name} PROPERTIES TIMEOUT 300 LABELS slow)
endfunction()
if(NOT KORVA_SANITIZE)
    korva_endpoint_load(RequestsToAnEndpointLeaveMemoryFilesAndThreadsAsTheyWere
        --settle 4000 --requests 4000 --connections 8)
else()
    korva_endpoint_load(RequestsToAnEndpointLeaveFilesAndThreadsAsTheyWere
        --settle 500 --requests 1000 --connections 8 --no-memory)
endif()
