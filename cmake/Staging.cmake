# Lays out a tree that looks like a controller's file system in the build folder, so that a
# development build finds its configuration and shared files without touching the machine's.

# qitrmc_stage(SOURCE DESTINATION): copies a file to DESTINATION, an absolute path on a controller,
# below QITRMC_ROOT. Nothing is staged for a build with an empty root: there an installation does it.
function(qitrmc_stage source destination)
  if(QITRMC_ROOT)
    configure_file("${source}" "${QITRMC_ROOT}${destination}" COPYONLY)
  endif()
endfunction()
