# `cmake --install` for developers, component "development": the library and its default client, headers, and what
# find_package(torvane) and pkg-config read. The program is installed by packages.cmake.
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)
set(CMAKE_INSTALL_DEFAULT_COMPONENT_NAME development)

set(TORVANE_PACKAGE_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/torvane)
set(TORVANE_PKGCONFIG_DIR ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
install(TARGETS torvane EXPORT torvane-targets)
install(TARGETS torvane_client EXPORT torvane-client-targets)
install(DIRECTORY ${PROJECT_SOURCE_DIR}/includes/torvane TYPE INCLUDE)
install(EXPORT torvane-targets NAMESPACE torvane:: DESTINATION ${TORVANE_PACKAGE_DIR})
install(EXPORT torvane-client-targets NAMESPACE torvane:: DESTINATION ${TORVANE_PACKAGE_DIR})
write_basic_package_version_file(torvane-config-version.cmake COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_SOURCE_DIR}/cmake/torvane-config.cmake ${PROJECT_BINARY_DIR}/torvane-config-version.cmake
  DESTINATION ${TORVANE_PACKAGE_DIR})

# Places are told from that of the .pc file, so that what is installed can be moved. The archives hold no code of libjpeg,
# so each program asks for it too.
file(RELATIVE_PATH TORVANE_PREFIX_FROM_PC /prefix/${TORVANE_PKGCONFIG_DIR} /prefix)
string(REGEX REPLACE "/$" "" TORVANE_PREFIX_FROM_PC ${TORVANE_PREFIX_FROM_PC})
foreach(name torvane torvane-client)
  string(REPLACE - _ TORVANE_PC_ARCHIVE ${name})
  set(TORVANE_PC_NAME ${name})
  configure_file(${PROJECT_SOURCE_DIR}/cmake/torvane.pc.in ${name}.pc @ONLY)
  install(FILES ${PROJECT_BINARY_DIR}/${name}.pc DESTINATION ${TORVANE_PKGCONFIG_DIR})
endforeach()
