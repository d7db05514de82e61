# Functions that build and register unit tests.

find_package(GTest REQUIRED)

# All that the thread sanitizer's tests need: the programs below with the label "concurrent", and the
# service for the tests over HTTP.
add_custom_target(concurrent_tests DEPENDS service)

# The programs write what came of each of their tests here; scripts/test counts those.
set(QITRMC_UNIT_RESULTS "${PROJECT_BINARY_DIR}/unit-results")

# qitrmc_unit_test(NAME SOURCES ... LIBRARIES ... [LABELS concurrent] [PIECES NUMBER]): one GoogleTest
# program. It is one test of CTest, or one for each of several equal pieces, if it takes long, which run
# side by side and first: starting a process for each test case takes longer than most of them. Tests with
# the label "concurrent" also run under the thread sanitizer.
function(qitrmc_unit_test name)
  cmake_parse_arguments(PARSE_ARGV 1 test "" "LABELS;PIECES" "SOURCES;LIBRARIES")
  add_executable(${name} ${test_SOURCES})
  target_include_directories(${name} PRIVATE "${PROJECT_SOURCE_DIR}/tests")
  target_link_libraries(${name} PRIVATE ${test_LIBRARIES} GTest::gmock GTest::gtest_main)
  # In half of the time that the usual linker takes. What is shipped is linked by that one.
  target_link_options(${name} PRIVATE -fuse-ld=gold)
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
  else()
    set(test_LABELS sequential)
  endif()
  if(NOT test_PIECES)
    set(test_PIECES 1)
  endif()
  foreach(piece RANGE 1 ${test_PIECES})
    math(EXPR index "${piece} - 1")
    add_test(NAME ${name}.${piece}
      COMMAND ${name} --gtest_brief=1 "--gtest_output=xml:${QITRMC_UNIT_RESULTS}/${name}.${piece}.xml")
    set_tests_properties(${name}.${piece} PROPERTIES
      ENVIRONMENT "GTEST_TOTAL_SHARDS=${test_PIECES};GTEST_SHARD_INDEX=${index}"
      LABELS "${test_LABELS};gtest" COST ${test_PIECES} TIMEOUT 300)
  endforeach()
endfunction()
