# Creates a copy of a controller's directory layout in the build folder, so that a development build
# finds its configuration and shared files there and does not use those of the machine.

# qitrmc_stage(SOURCE DESTINATION): copies a file to DESTINATION, an absolute path on a controller,
# below QITRMC_ROOT. Does nothing if that is empty: the files are then installed.
function(qitrmc_stage source destination)
  if(QITRMC_ROOT)
    configure_file("${source}" "${QITRMC_ROOT}${destination}" COPYONLY)
  endif()
endfunction()
