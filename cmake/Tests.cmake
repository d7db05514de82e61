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
  # Several sources are compiled as one, which takes half as long. Those of other folders stay apart,
  # since many programs use them.
  set_target_properties(${name} PROPERTIES UNITY_BUILD ON UNITY_BUILD_BATCH_SIZE 6)
  foreach(source IN LISTS test_SOURCES)
    if(IS_ABSOLUTE "${source}")
      set_source_files_properties("${source}" PROPERTIES SKIP_UNITY_BUILD_INCLUSION ON)
    endif()
  endforeach()
  if(test_LABELS)
    add_dependencies(concurrent_tests ${name})
  endif()
  if(CMAKE_CROSSCOMPILING)
    return() # scripts/test-armel runs each program as a whole
  endif()
  if(NOT test_LABELS)
    set(test_LABELS sequential)
  endif()
  gtest_discover_tests(${name} TEST_PREFIX "${name}." DISCOVERY_TIMEOUT 60
                       PROPERTIES LABELS ${test_LABELS} TIMEOUT 120)
endfunction()
