# One test program for each folder of tests/.
#
#   kestrum_test(tests_lte USES loggenerator_lte test_support SOURCES ServingCellMeasurementTest.cpp)
find_package(GTest)

function(kestrum_test name)
    cmake_parse_arguments(arg "" "" "USES;SOURCES;LIBRARIES" ${ARGN})
    add_executable(${name} ${arg_SOURCES})
    target_link_libraries(${name} PRIVATE ${arg_USES} ${arg_LIBRARIES} GTest::gmock GTest::gtest GTest::gtest_main)
    target_compile_definitions(${name} PRIVATE KESTRUM_SOURCE_DIR="${CMAKE_SOURCE_DIR}"
        KESTRUM_BINARY_DIR="${CMAKE_RUNTIME_OUTPUT_DIRECTORY}")
    # What is tested is optimised as it ships; the tests themselves need not wait for it.
    target_compile_options(${name} PRIVATE $<$<CONFIG:Release>:-O0>)
    add_test(NAME ${name} COMMAND ${name})
    set_tests_properties(${name} PROPERTIES TIMEOUT 300)
endfunction()
