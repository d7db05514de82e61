# Manual pages, and what Debian wants in the documentation folder of every package.

# qitrmc_compress(SOURCE DESTINATION): a compressed copy that is the same whenever it is made.
set(compressed)
function(qitrmc_compress source destination)
  add_custom_command(
    OUTPUT "${destination}"
    COMMAND gzip -9nc "${source}" > "${destination}"
    DEPENDS "${source}"
    VERBATIM)
  set(compressed "${compressed};${destination}" PARENT_SCOPE)
endfunction()

set(built "${CMAKE_CURRENT_BINARY_DIR}")
qitrmc_compress("${CMAKE_CURRENT_SOURCE_DIR}/debian/changelog" "${built}/changelog.gz")
foreach(page qitrmc-host.1 qitrmc-explain.1)
  qitrmc_compress("${CMAKE_CURRENT_SOURCE_DIR}/man/${page}" "${built}/${page}.gz")
endforeach()
add_custom_target(compressed_documents ALL DEPENDS ${compressed})

install(FILES "${built}/qitrmc-host.1.gz" DESTINATION share/man/man1 COMPONENT qitrmc-host)
install(FILES "${built}/qitrmc-explain.1.gz" DESTINATION share/man/man1 COMPONENT qitrmc-tools)
foreach(package IN LISTS QITRMC_PACKAGES)
  set(copyright debian/copyright)
  if(package STREQUAL qitrmc-web)
    set(copyright "${QITRMC_CLIENTS}/web-copyright")
  endif()
  install(FILES "${copyright}" DESTINATION "share/doc/${package}" RENAME copyright
          COMPONENT "${package}")
  install(FILES "${built}/changelog.gz" DESTINATION "share/doc/${package}" COMPONENT "${package}")
  if(EXISTS "${CMAKE_CURRENT_SOURCE_DIR}/debian/${package}.lintian-overrides")
    install(FILES "debian/${package}.lintian-overrides" DESTINATION share/lintian/overrides
            RENAME "${package}" COMPONENT "${package}")
  endif()
endforeach()
