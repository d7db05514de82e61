# Functions that build and register unit tests.

find_package(GTest REQUIRED)

# All that the thread sanitizer's tests need: the programs below with the label "concurrent", and the
# service for the tests over HTTP.
add_custom_target(concurrent_tests DEPENDS service)

# The programs write what came of each of their tests here; scripts/test counts those.
set(QITRMC_UNIT_RESULTS "${PROJECT_BINARY_DIR}/unit-results")

# qitrmc_join_sources(PROGRAM RESULT sources...): a list of sources that contain up to six of those each,
# which take half of the time to compile. Sources with absolute paths stay apart, since many programs use them.
# CMake's own way to do so includes by absolute paths: the compiler cache would have to preprocess them.
function(qitrmc_join_sources program result)
  set(joined ${ARGN})
  list(FILTER joined EXCLUDE REGEX "^/")
  set(sources ${ARGN})
  list(FILTER sources INCLUDE REGEX "^/")
  file(RELATIVE_PATH folder "${PROJECT_SOURCE_DIR}/tests" "${CMAKE_CURRENT_SOURCE_DIR}")
  while(joined)
    list(SUBLIST joined 0 6 batch)
    list(GET batch 0 first)
    list(REMOVE_ITEM joined ${batch})
    list(TRANSFORM batch REPLACE ".+" "#include \"${folder}/\\0\"\n")
    string(CONCAT text ${batch})
    set(source "${CMAKE_CURRENT_BINARY_DIR}/${program}/${first}")
    file(CONFIGURE OUTPUT "${source}" CONTENT "${text}" @ONLY)
    list(APPEND sources "${source}")
  endwhile()
  set(${result} "${sources}" PARENT_SCOPE)
endfunction()

# qitrmc_test_paths(PROGRAM NAME PATH ...): gives the program constants that tests/support/TestPaths.h
# declares. In a source of their own, since paths differ from folder to folder and the compiler cache is to
# find all other sources.
function(qitrmc_test_paths program)
  set(text "#include \"support/TestPaths.h\"\n")
  set(rest ${ARGN})
  while(rest)
    list(POP_FRONT rest constant path)
    string(APPEND text "const char* const ${constant} = \"${path}\";\n")
  endwhile()
  set(source "${CMAKE_CURRENT_BINARY_DIR}/${program}/paths.cpp")
  file(GENERATE OUTPUT "${source}" CONTENT "${text}" TARGET ${program})
  target_sources(${program} PRIVATE "${source}")
endfunction()

# qitrmc_unit_test(NAME SOURCES ... LIBRARIES ... [LABELS concurrent] [PIECES NUMBER]): one GoogleTest
# program. It is one test of CTest, or one for each of several equal pieces, if it takes long, which run
# side by side and first: starting a process for each test case takes longer than most of them. Tests with
# the label "concurrent" also run under the thread sanitizer.
function(qitrmc_unit_test name)
  cmake_parse_arguments(PARSE_ARGV 1 test "" "LABELS;PIECES" "SOURCES;LIBRARIES")
  qitrmc_join_sources(${name} sources ${test_SOURCES})
  add_executable(${name} ${sources})
  target_include_directories(${name} PRIVATE "${PROJECT_SOURCE_DIR}/tests")
  target_link_libraries(${name} PRIVATE ${test_LIBRARIES} GTest::gmock GTest::gtest_main)
  # In half of the time that the usual linker takes. What is shipped is linked by that one.
  target_link_options(${name} PRIVATE -fuse-ld=$<IF:$<CXX_COMPILER_ID:Clang>,lld,gold>)
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
