# Reads src/qitrmcwebsvc/methods.def into lists for the build: each method has a schema and a source
# file named after its class.

set(methods_file "${PROJECT_SOURCE_DIR}/src/qitrmcwebsvc/methods.def")
set_property(DIRECTORY "${PROJECT_SOURCE_DIR}" APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS
             "${methods_file}")
file(READ "${methods_file}" methods_text)
set(methods_row "QITRMC_METHOD\\(\"([A-Za-z]+)\",[ \n]+([A-Za-z]+),[ \n]+\"([a-z_]+\\.json)\"\\)")
string(REGEX MATCHALL "${methods_row}" methods_rows "${methods_text}")
set(QITRMC_METHOD_SOURCES)
set(lower_case_rows)
set(upper_case_rows)
foreach(row IN LISTS methods_rows)
  string(REGEX REPLACE "${methods_row}" "procedure/\\2.cpp" source "${row}")
  list(APPEND QITRMC_METHOD_SOURCES "${source}")
  if(row MATCHES "\\(\"[a-z]")
    list(APPEND lower_case_rows "${row}")
  else()
    list(APPEND upper_case_rows "${row}")
  endif()
endforeach()

# Sorted by method name, with names in lower case first.
list(SORT lower_case_rows)
list(SORT upper_case_rows)
list(TRANSFORM lower_case_rows REPLACE "${methods_row}" "\\3")
list(TRANSFORM upper_case_rows REPLACE "${methods_row}" "\\3")
set(QITRMC_METHOD_SCHEMAS ${lower_case_rows} ${upper_case_rows})
