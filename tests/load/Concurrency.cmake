# The framework's own logging writes the records, so nothing here may define ZBLogger.
set(load_properties)
if(KORVA_SANITIZE MATCHES "thread")
    set(load_properties
        ENVIRONMENT "TSAN_OPTIONS=suppressions=${CMAKE_CURRENT_SOURCE_DIR}/shared-by-design.supp")
endif()

set(endpoint_sources)
set(endpoint_libraries)
if(KORVA_SERVER)
    set(endpoint_sources EndpointConcurrencyTest.cpp EndpointClients.cpp)
    set(endpoint_libraries korva::server korva_endpoint_process)
endif()
korva_test(concurrency_tests
    SOURCES ConcurrencyTest.cpp ${endpoint_sources}
    LIBRARIES korva_requests korva_simulated_host korva::vainstrumentation ${endpoint_libraries}
    PROPERTIES ${load_properties})
add_dependencies(concurrency_tests korvaosstatusfacade)
if(KORVA_SERVER)
    add_dependencies(concurrency_tests korva_schema korvacomputersystemprovider)
endif()

# The same without the list: reports must come, and about nothing else.
if(KORVA_SANITIZE MATCHES "thread")
    add_test(NAME load.ThreadSanitizerReportsTheSharedVariablesAndNothingElse
        COMMAND sh "${CMAKE_CURRENT_SOURCE_DIR}/unsuppressed.sh" $<TARGET_FILE:concurrency_tests>
            "${CMAKE_CURRENT_SOURCE_DIR}/shared-by-design.supp")
    set_tests_properties(load.ThreadSanitizerReportsTheSharedVariablesAndNothingElse
        PROPERTIES TIMEOUT 300)
endif()
