# qitrmc_status_codes(FORM OUTPUT): generates C++ from the tables of the status codes. FORM is an
# option of make_codes.py.
function(qitrmc_status_codes form output)
  set(statuses "${PROJECT_SOURCE_DIR}/share/statuses")
  add_custom_command(
    OUTPUT "${output}"
    COMMAND Python3::Interpreter "${statuses}/make_codes.py" ${form} "${output}"
    DEPENDS
      "${statuses}/catalogue.tsv"
      "${statuses}/driver.tsv"
      "${statuses}/make_codes.py"
      "${statuses}/status_tables.py"
      "${PROJECT_SOURCE_DIR}/simulator/status/statuses.tsv"
      ${QITRMC_LANGUAGES}
    COMMENT "Naming the status codes"
    VERBATIM)
endfunction()
