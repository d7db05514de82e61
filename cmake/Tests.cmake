# Functions that build and register unit tests.

find_package(GTest REQUIRED)
include(GoogleTest)

# All that the thread sanitizer's tests need: the programs below with the label "concurrent", and the
# service for the tests over HTTP.
add_custom_target(concurrent_tests DEPENDS service)

# qitrmc_unit_test(NAME SOURCES ... LIBRARIES ... [LABELS concurrent]): one GoogleTest program, with
# each test case registered separately in CTest. Tests with the label "concurrent" also run under
# the thread sanitizer.
function(qitrmc_unit_test name)
  cmake_parse_arguments(PARSE_ARGV 1 test "" "LABELS" "SOURCES;LIBRARIES")
  add_executable(${name} ${test_SOURCES})
  target_include_directories(${name} PRIVATE "${PROJECT_SOURCE_DIR}/tests")
  target_link_libraries(${name} PRIVATE ${test_LIBRARIES} GTest::gmock GTest::gtest_main)
  # The code under test keeps its own optimisation. With that of a release the tests take twice as
  # long to compile.
  target_compile_options(${name} PRIVATE $<$<CONFIG:Release>:-O1>)
  if(test_LABELS)
    add_dependencies(concurrent_tests ${name})
  endif()
  if(NOT test_LABELS)
    set(test_LABELS sequential)
  endif()
  gtest_discover_tests(${name} TEST_PREFIX "${name}." DISCOVERY_TIMEOUT 60
                       PROPERTIES LABELS ${test_LABELS} TIMEOUT 120)
endfunction()
