# The soak loads and unloads the facade and the provider: nothing of them or of the framework may be in
# the program itself. What chooses the host comes and goes with them.
add_library(load_hosts MODULE Hosts.cpp)
target_link_libraries(load_hosts PRIVATE korva_simulated_host korva::vainstrumentation)
korva_shared_library(load_hosts)

add_executable(soak Soak.cpp Workload.cpp)
set_target_properties(soak PROPERTIES UNITY_BUILD OFF)
target_compile_definitions(soak PRIVATE
    KORVA_BINARY_DIR="${CMAKE_BINARY_DIR}" KORVA_LOAD_HOSTS="$<TARGET_FILE:load_hosts>")
target_link_libraries(soak PRIVATE korva_requests korva::options)
add_dependencies(soak load_hosts korvaosstatusfacade)

# korva_soak(<name> <option>...): a soak is one test.
function(korva_soak name)
    add_test(NAME load.${name}
        COMMAND "${CMAKE_CURRENT_SOURCE_DIR}/run" $<TARGET_FILE:soak> ${ARGN})
    set_tests_properties(load.${name} PROPERTIES TIMEOUT 300 COST 100 LABELS slow)
endfunction()

# On a busy machine the last page that is ever used may come late: a tenth and a fifth of the requests come
# before the first reading.
# The address sanitizer keeps freed memory: only files and threads count then, and what it reports itself.
if(NOT KORVA_SANITIZE)
    korva_soak(TwoHundredThousandRequestsLeaveMemoryFilesAndThreadsAsTheyWere
        --requests 180000 --settle 20000)
    korva_soak(RequestsOnEightThreadsLeaveMemoryFilesAndThreadsAsTheyWere
        --requests 32000 --settle 8000 --threads 8)
else()
    korva_soak(RequestsLeaveFilesAndThreadsAsTheyWere --settle 1000 --requests 3000 --no-memory)
    korva_soak(RequestsOnEightThreadsLeaveFilesAndThreadsAsTheyWere
        --settle 1000 --requests 3000 --threads 8 --no-memory)
endif()

# In 32-bit valgrind needs the symbols of the 32-bit loader, for which there is no package among those of
# a 64-bit system.
if(NOT KORVA_SANITIZE AND KORVA_WORD_SIZE STREQUAL "64")
    add_test(NAME load.ValgrindFindsNoErrorAndNothingThatIsNotFreed
        COMMAND "${CMAKE_CURRENT_SOURCE_DIR}/memcheck" $<TARGET_FILE:soak>)
    set_tests_properties(load.ValgrindFindsNoErrorAndNothingThatIsNotFreed PROPERTIES
        TIMEOUT 300 SKIP_RETURN_CODE 77 LABELS slow)
endif()
