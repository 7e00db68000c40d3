# What is installed, where, and in which package.
include(CMakePackageConfigHelpers)

set(KESTREL_HEADERS
  file/baslafile.h
  host/port_file.h
  host/port_interrupt.h
  host/port_msgman.h
  host/port_process.h
  host/ut_darray.h
  host/ut_str.h
  launcher/baslauncher.h
  launcher/explanation.h
  rules/baslarules.h
  rules/owning_array.h
  rules/rule.h
  rules/status.h)
set(KESTREL_CMAKE_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/KestrelLauncher)

# The command, its data and its manual.
install(TARGETS kestrel-launch COMPONENT command)
install(DIRECTORY data DESTINATION ${CMAKE_INSTALL_DATADIR}/kestrel-launcher COMPONENT command)
install(FILES docs/json-output.schema.json
  DESTINATION ${CMAKE_INSTALL_DATADIR}/kestrel-launcher COMPONENT command)
install(FILES docs/kestrel-launch.1 DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 COMPONENT command)
install(FILES docs/kestrel-rules.5 DESTINATION ${CMAKE_INSTALL_MANDIR}/man5 COMPONENT command)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/completion.bash RENAME kestrel-launch
  DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions COMPONENT command)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/completion.zsh RENAME _kestrel-launch
  DESTINATION ${CMAKE_INSTALL_DATADIR}/zsh/site-functions COMPONENT command)

# The library for programs that run, and for those that are built.
install(TARGETS kestrel-launcher kestrel-launcher-static EXPORT KestrelLauncher
  LIBRARY COMPONENT library NAMELINK_COMPONENT development
  ARCHIVE COMPONENT development)
foreach(header ${KESTREL_HEADERS})
  get_filename_component(folder ${header} DIRECTORY)
  install(FILES ${header} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/kestrel-launcher/${folder}
    COMPONENT development)
endforeach()
install(EXPORT KestrelLauncher NAMESPACE KestrelLauncher:: FILE KestrelLauncherConfig.cmake
  DESTINATION ${KESTREL_CMAKE_DIR} COMPONENT development)
write_basic_package_version_file(KestrelLauncherConfigVersion.cmake COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/KestrelLauncherConfigVersion.cmake
  DESTINATION ${KESTREL_CMAKE_DIR} COMPONENT development)
file(RELATIVE_PATH KESTREL_PREFIX /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
string(REGEX REPLACE "/$" "" KESTREL_PREFIX "${KESTREL_PREFIX}")
configure_file(cmake/kestrel-launcher.pc.in kestrel-launcher.pc @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/kestrel-launcher.pc
  DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)

if(PROJECT_IS_TOP_LEVEL)
  include(cmake/package.cmake)
endif()
