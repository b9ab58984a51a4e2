# The framework's own logging writes the records, so nothing here may define ZBLogger.
set(load_properties)
if(KORVA_SANITIZE MATCHES "thread")
    set(load_properties
        ENVIRONMENT "TSAN_OPTIONS=suppressions=${CMAKE_CURRENT_SOURCE_DIR}/shared-by-design.supp")
endif()

korva_test(concurrency_tests
    SOURCES ConcurrencyTest.cpp
    LIBRARIES korva_requests korva_simulated_host korva::vainstrumentation
    PROPERTIES ${load_properties})
add_dependencies(concurrency_tests korvaosstatusfacade)

# The same without the list: reports must come, and about nothing else.
if(KORVA_SANITIZE MATCHES "thread")
    add_test(NAME load.ThreadSanitizerReportsTheSharedVariablesAndNothingElse
        COMMAND sh "${CMAKE_CURRENT_SOURCE_DIR}/unsuppressed.sh" $<TARGET_FILE:concurrency_tests>
            "${CMAKE_CURRENT_SOURCE_DIR}/shared-by-design.supp")
    set_tests_properties(load.ThreadSanitizerReportsTheSharedVariablesAndNothingElse
        PROPERTIES TIMEOUT 300)
endif()
