# The packages for people who use a chassis: the Python package and the page for a browser.

set(QITRMC_CLIENTS "" CACHE PATH
    "Folder that packaging/clients/make has filled; empty for an installation without the clients")

if(QITRMC_CLIENTS)
  list(APPEND QITRMC_PACKAGES python3-qitrmc)
  install(DIRECTORY "${QITRMC_CLIENTS}/python/usr/" DESTINATION . USE_SOURCE_PERMISSIONS
          COMPONENT python3-qitrmc)
  if(EXISTS "${QITRMC_CLIENTS}/web")
    list(APPEND QITRMC_PACKAGES qitrmc-web)
    install(DIRECTORY "${QITRMC_CLIENTS}/web" DESTINATION share/qitrmc COMPONENT qitrmc-web)
  endif()
endif()
