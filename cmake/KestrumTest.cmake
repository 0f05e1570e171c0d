# One test program per folder of tests/.
#
#   kestrum_test(tests_lte USES loggenerator_lte test_doubles
#       SOURCES ServingCellMeasurementTest.cpp
#       WITH_PROPERTY_LISTS LTELogGeneratorTest.cpp)
#
# The sources after WITH_PROPERTY_LISTS are omitted from a build without platform_propertylist. SEPARATE: see
# KestrumJoin.
find_package(GTest)
find_package(rapidcheck REQUIRED)

# The test libraries' headers take most of a test's compile time, so they are compiled once for all tests. The preset
# sets the optimisation of the product's code. Tests are never optimised: it would double their compile time.
add_library(test_headers OBJECT EXCLUDE_FROM_ALL ${CMAKE_SOURCE_DIR}/tests/harness/Headers.cpp)
target_precompile_headers(test_headers PRIVATE <gmock/gmock.h> <gtest/gtest.h> <rapidcheck.h> <rapidcheck/gtest.h>
    <algorithm> <chrono> <filesystem> <fstream> <functional> <map> <memory> <set> <sstream> <string> <vector>)
function(kestrum_test_options name)
    target_compile_options(${name} PRIVATE -fPIC -O0)
    target_link_libraries(${name} PRIVATE GTest::gmock GTest::gtest rapidcheck rapidcheck_gtest)
endfunction()
kestrum_test_options(test_headers)

# SHARDS n runs a program's tests as n parallel processes. ctest counts in quarters of a processor (./test sets that):
# a program takes a whole processor, a program that WAITS for real time a quarter.
function(kestrum_test name)
    cmake_parse_arguments(arg "WAITS;MEASURES_MEMORY" "SHARDS" "USES;SOURCES;WITH_PROPERTY_LISTS;LIBRARIES;SEPARATE" ${ARGN})
    add_executable(${name} ${arg_SOURCES})
    if(arg_WITH_PROPERTY_LISTS AND TARGET platform_propertylist)
        target_sources(${name} PRIVATE ${arg_WITH_PROPERTY_LISTS})
        target_link_libraries(${name} PRIVATE platform_propertylist)
    endif()
    target_link_libraries(${name} PRIVATE ${arg_USES} ${arg_LIBRARIES} test_surroundings test_places GTest::gtest_main)
    kestrum_test_options(${name})
    kestrum_join(${name} SEPARATE ${arg_SEPARATE})
    target_precompile_headers(${name} REUSE_FROM test_headers)
    set(processors 4)
    if(arg_WAITS)
        set(processors 1)
    endif()
    set(environment)
    if(arg_MEASURES_MEMORY)
        # By default the address sanitizer keeps hundreds of MB of freed blocks, which would count as memory in use.
        set(environment ASAN_OPTIONS=quarantine_size_mb=1:thread_local_quarantine_size_kb=64)
    endif()
    # The time limit ends a test that hangs. Under the sanitizers on a slow machine the slowest test takes minutes.
    if(NOT arg_SHARDS)
        add_test(NAME ${name} COMMAND ${name})
        set_tests_properties(${name} PROPERTIES TIMEOUT 1800 PROCESSORS ${processors} ENVIRONMENT "${environment}")
        return()
    endif()
    foreach(shard RANGE 1 ${arg_SHARDS})
        math(EXPR index "${shard} - 1")
        add_test(NAME ${name}_${shard} COMMAND ${name})
        # The longest tests start first.
        set_tests_properties(${name}_${shard} PROPERTIES TIMEOUT 1800 PROCESSORS ${processors} COST 100
            ENVIRONMENT "GTEST_TOTAL_SHARDS=${arg_SHARDS};GTEST_SHARD_INDEX=${index};${environment}")
    endforeach()
endfunction()
