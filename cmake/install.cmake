# `cmake --install`: the program, and the library with its headers and what find_package(torvane) reads.
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)

set(TORVANE_PACKAGE_DIR ${CMAKE_INSTALL_LIBDIR}/cmake/torvane)
install(TARGETS q7r)
install(TARGETS torvane EXPORT torvane-targets)
install(DIRECTORY ${PROJECT_SOURCE_DIR}/includes/torvane TYPE INCLUDE)
install(EXPORT torvane-targets NAMESPACE torvane:: DESTINATION ${TORVANE_PACKAGE_DIR})
write_basic_package_version_file(torvane-config-version.cmake COMPATIBILITY SameMajorVersion)
install(FILES ${PROJECT_SOURCE_DIR}/cmake/torvane-config.cmake ${PROJECT_BINARY_DIR}/torvane-config-version.cmake
  DESTINATION ${TORVANE_PACKAGE_DIR})
