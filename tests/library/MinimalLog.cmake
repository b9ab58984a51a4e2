# The provider's sources once more, against a logging layer of another make that offers only what the
# provider calls. The program below reads the records of its library.
add_library(minimal_log SHARED EXCLUDE_FROM_ALL
    minimal_log/ZBMessageBuffer.cpp ../support/RecordingLog.cpp)
set_target_properties(minimal_log PROPERTIES
    CXX_VISIBILITY_PRESET default LIBRARY_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/minimal-log/lib")
target_include_directories(minimal_log
    BEFORE PUBLIC "${CMAKE_CURRENT_SOURCE_DIR}/minimal_log" PRIVATE "${PROJECT_SOURCE_DIR}/tests")
target_link_libraries(minimal_log PRIVATE korva::options)

get_target_property(folder osstatusprovider_objects SOURCE_DIR)
get_target_property(sources osstatusprovider_objects SOURCES)
list(TRANSFORM sources PREPEND "${folder}/")
add_library(minimal_log_provider SHARED EXCLUDE_FROM_ALL ${sources})
set_target_properties(minimal_log_provider PROPERTIES UNITY_BUILD OFF
    OUTPUT_NAME korzbosstatusprofileprovider SOVERSION 1
    LIBRARY_OUTPUT_DIRECTORY "${CMAKE_BINARY_DIR}/minimal-log/lib")
target_include_directories(minimal_log_provider
    BEFORE PRIVATE "${CMAKE_CURRENT_SOURCE_DIR}/minimal_log" "${folder}")
target_link_libraries(minimal_log_provider
    PRIVATE minimal_log vaprovider vainstrumentation korva::options korva::base korva::cmpi)

add_library(minimal_log_fixture OBJECT EXCLUDE_FROM_ALL LibraryFixture.cpp)
target_compile_definitions(minimal_log_fixture PRIVATE
    KORVA_BINARY_DIR="${CMAKE_BINARY_DIR}/minimal-log")
target_link_libraries(minimal_log_fixture
    PUBLIC korva_requests korva_simulated_host korva::vainstrumentation GTest::gmock)

korva_test(minimal_log_tests
    SOURCES RecordsTest.cpp
    LIBRARIES minimal_log minimal_log_fixture korva_requests korva::vainstrumentation)
add_dependencies(minimal_log_tests minimal_log_provider)
