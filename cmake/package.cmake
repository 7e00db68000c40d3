# Debian packages: cpack -G DEB
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_CONTACT "The Kestrel launcher authors <kestrel-launcher@localhost>")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_ALL command library development)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SECTION electronics)

set(CPACK_DEBIAN_COMMAND_PACKAGE_NAME kestrel-launcher)
set(CPACK_DEBIAN_COMMAND_PACKAGE_SUGGESTS yosys)
set(CPACK_COMPONENT_COMMAND_DESCRIPTION
  "command that finds or makes native netlists\n\
 Plans from rules a chain of conversions that ends in the native netlist of a\n\
 name, and runs those that are due.")

set(CPACK_DEBIAN_LIBRARY_PACKAGE_NAME libkestrel-launcher${PROJECT_VERSION_MAJOR})
set(CPACK_DEBIAN_LIBRARY_PACKAGE_SECTION libs)
set(CPACK_DEBIAN_LIBRARY_PACKAGE_RECOMMENDS kestrel-launcher)
set(CPACK_DEBIAN_LIBRARY_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_COMPONENT_LIBRARY_DESCRIPTION
  "library that finds or makes native netlists\n Shared library for host programs.")

set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libkestrel-launcher-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS
  "libkestrel-launcher${PROJECT_VERSION_MAJOR} (= ${PROJECT_VERSION})")
set(CPACK_COMPONENT_DEVELOPMENT_DESCRIPTION
  "library that finds or makes native netlists - development files\n\
 Headers, archive, and what CMake and pkg-config need.")
include(CPack)
