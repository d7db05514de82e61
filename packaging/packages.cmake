# Debian packages, one for each component of the installation. scripts/package makes them.

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME qitrmc)
set(CPACK_PACKAGE_CONTACT "qitrmc maintainers <maintainers@users.noreply.c-seed-e9c5b347.example>")
set(CPACK_COMPONENTS_ALL ${QITRMC_PACKAGES})
set(CPACK_COMPONENTS_GROUPING IGNORE)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_SET_DESTDIR ON)
set(CPACK_STRIP_FILES ON)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS OWNER_READ OWNER_WRITE OWNER_EXECUTE
    GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)

# The driver and the web runtime of a controller come in no package: nothing depends on one.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS "${CMAKE_LIBRARY_OUTPUT_DIRECTORY}")
if(CMAKE_CROSSCOMPILING)
  set(CPACK_DEBIAN_PACKAGE_ARCHITECTURE armel)
  list(APPEND CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS
       "${CMAKE_SYSROOT}/lib/${CMAKE_LIBRARY_ARCHITECTURE}"
       "${CMAKE_SYSROOT}/usr/lib/${CMAKE_LIBRARY_ARCHITECTURE}")
endif()

function(qitrmc_package name section summary text)
  string(TOUPPER "${name}" component)
  set(CPACK_DEBIAN_${component}_PACKAGE_NAME "${name}" PARENT_SCOPE)
  set(CPACK_DEBIAN_${component}_PACKAGE_SECTION "${section}" PARENT_SCOPE)
  set(CPACK_DEBIAN_${component}_DESCRIPTION "${summary}\n${text}" PARENT_SCOPE)
  set(extra)
  foreach(script conffiles postinst prerm postrm)
    set(file "${PROJECT_SOURCE_DIR}/packaging/debian/${name}/${script}")
    if(EXISTS "${file}")
      list(APPEND extra "${file}")
    endif()
  endforeach()
  set(CPACK_DEBIAN_${component}_PACKAGE_CONTROL_EXTRA "${extra}" PARENT_SCOPE)
endfunction()

qitrmc_package(libqitrmcsvc libs "web service for a modular instrument chassis"
"Plug-in for the web server on the controller of a modular instrument chassis.
It answers JSON-RPC 2.0 over HTTP: sessions, reservations, properties,
commands, registers and memory of the devices. The driver of the chassis and
the web server come with the controller.")
qitrmc_package(qitrmc-tools utils "explanations of the status codes of an instrument chassis"
"The program qitrmc-explain prints what a status code, an error object or a
status text of the chassis web service means, in six languages.")
qitrmc_package(qitrmc-dev libdevel "headers of an instrument chassis and its web service"
"C headers of the chassis driver, the web runtime, the simulated chassis and
the libraries that the web service may use, with an example of a program.")
qitrmc_package(qitrmc-host web "development web server for a chassis web service"
"A small web server that loads the chassis web service, for development and
tests, on a machine that has no server of a controller. Comes with a systemd
service for one chassis and a template for several.")
qitrmc_package(qitrmc-simulator misc "simulated instrument chassis"
"Stands in for the driver of a chassis: devices, registers and memory that are
described by a file, with moving values and faults on demand. It lies in a
folder of its own and never takes the place of a driver.")

qitrmc_package(python3-qitrmc python "modular instrument chassis from Python and the command line"
"The Python package qitrmc uses a chassis through its web service: sessions,
properties, commands, registers and memory of the devices. The command qitrmc
does the same for people and scripts.")
qitrmc_package(qitrmc-web web "page in the browser for an instrument chassis"
"Shows the modules of a chassis, their properties, live plots, registers and
memory. Served by qitrmc-host, or by a web server in front of a controller.")

foreach(package IN ITEMS QITRMC-DEV PYTHON3-QITRMC QITRMC-WEB)
  set(CPACK_DEBIAN_${package}_PACKAGE_SHLIBDEPS OFF)
  set(CPACK_DEBIAN_${package}_PACKAGE_ARCHITECTURE all)
endforeach()
if(QITRMC_CLIENTS)
  file(STRINGS "${QITRMC_CLIENTS}/python-depends" CPACK_DEBIAN_PYTHON3-QITRMC_PACKAGE_DEPENDS)
endif()
set(CPACK_DEBIAN_PYTHON3-QITRMC_PACKAGE_SUGGESTS
    "qitrmc-host, qitrmc-simulator, python3-pandas, python3-pytest")
set(CPACK_DEBIAN_QITRMC-WEB_PACKAGE_SUGGESTS "qitrmc-host, nginx-light")
set(CPACK_DEBIAN_LIBQITRMCSVC_PACKAGE_SUGGESTS "qitrmc-tools, qitrmc-host")
set(CPACK_DEBIAN_QITRMC-TOOLS_PACKAGE_RECOMMENDS libqitrmcsvc)
set(CPACK_DEBIAN_QITRMC-HOST_PACKAGE_DEPENDS "libqitrmcsvc (= ${PROJECT_VERSION})")
set(CPACK_DEBIAN_QITRMC-HOST_PACKAGE_RECOMMENDS qitrmc-simulator)
set(CPACK_DEBIAN_QITRMC-HOST_PACKAGE_SUGGESTS qitrmc-web)

if(CMAKE_CROSSCOMPILING)
  set(CPACK_PROJECT_CONFIG_FILE "${PROJECT_BINARY_DIR}/cross-packages.cmake")
  file(WRITE "${CPACK_PROJECT_CONFIG_FILE}"
       "set(SHLIBDEPS_EXECUTABLE \"${CMAKE_SYSROOT}/../bin/dpkg-shlibdeps\" CACHE FILEPATH \"\")\n")
endif()
include(CPack)
