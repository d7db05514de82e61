# Reads share/languages.tsv into lists for the build.

set(languages_file "${PROJECT_SOURCE_DIR}/share/languages.tsv")
set_property(DIRECTORY "${PROJECT_SOURCE_DIR}" APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS
             "${languages_file}")
set(QITRMC_LANGUAGES "${languages_file}" "${PROJECT_SOURCE_DIR}/share/languages.py")
file(STRINGS "${languages_file}" languages_rows REGEX "^[0-9]")
set(languages_row "^[0-9]+\t([a-z]+)\t([A-Za-z]+)\t[a-z]+\t[a-z]+$")
set(QITRMC_LANGUAGE_WORDS ${languages_rows})
list(TRANSFORM QITRMC_LANGUAGE_WORDS REPLACE "${languages_row}" "\\1")
set(QITRMC_LANGUAGE_FOLDERS ${languages_rows})
list(TRANSFORM QITRMC_LANGUAGE_FOLDERS REPLACE "${languages_row}" "\\2")
