# Debian packages: cpack -G DEB
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_CONTACT "The Kestrel launcher authors <kestrel-launcher@localhost>")
set(CPACK_PACKAGING_INSTALL_PREFIX ${CMAKE_INSTALL_PREFIX})
set(CPACK_STRIP_FILES ON)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_ALL command library development)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SECTION electronics)

set(CPACK_DEBIAN_COMMAND_PACKAGE_NAME kestrel-launcher)
set(CPACK_DEBIAN_COMMAND_PACKAGE_SUGGESTS yosys)
set(CPACK_DEBIAN_COMMAND_DESCRIPTION "command that finds or makes native netlists
The launcher finds a source for the name of a netlist, plans from rules the
conversions that lead to the native file, and runs those that are due.")

set(CPACK_DEBIAN_LIBRARY_PACKAGE_NAME libkestrel-launcher${PROJECT_VERSION_MAJOR})
set(CPACK_DEBIAN_LIBRARY_PACKAGE_SECTION libs)
set(CPACK_DEBIAN_LIBRARY_PACKAGE_RECOMMENDS kestrel-launcher)
set(CPACK_DEBIAN_LIBRARY_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_LIBRARY_DESCRIPTION "library that finds or makes native netlists
The shared library for host programs. The rules are in kestrel-launcher.")

set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libkestrel-launcher-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS
  "libkestrel-launcher${PROJECT_VERSION_MAJOR} (= ${PROJECT_VERSION})")
set(CPACK_DEBIAN_DEVELOPMENT_DESCRIPTION "library that finds or makes native netlists, to build with
Headers, the archive, and what CMake and pkg-config need.")
include(CPack)
