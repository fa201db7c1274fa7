# `cmake --install`, component "program", and what cpack makes of both components: Debian packages, and a tar of the sources.
option(TORVANE_BUILD_MANUAL "Write the manual pages with the program (needs help2man)" OFF)
set(CMAKE_INSTALL_DEFAULT_COMPONENT_NAME program)

set(Q7R_DOC_DIR ${CMAKE_INSTALL_DATADIR}/doc/q7r)
install(TARGETS q7r)
install(FILES ${PROJECT_SOURCE_DIR}/README.md ${PROJECT_SOURCE_DIR}/CHANGELOG.md DESTINATION ${Q7R_DOC_DIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/docs DESTINATION ${Q7R_DOC_DIR} FILES_MATCHING PATTERN "*.md" PATTERN "*.png")
install(DIRECTORY ${PROJECT_SOURCE_DIR}/examples DESTINATION ${Q7R_DOC_DIR})
install(FILES ${PROJECT_SOURCE_DIR}/packaging/after-effects/export-composition.jsx
  DESTINATION ${CMAKE_INSTALL_DATADIR}/q7r/after-effects)
set(COMPLETIONS ${PROJECT_SOURCE_DIR}/packaging/completions)
install(FILES ${COMPLETIONS}/q7r.bash DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions RENAME q7r)
install(FILES ${COMPLETIONS}/q7r.zsh DESTINATION ${CMAKE_INSTALL_DATADIR}/zsh/vendor-completions RENAME _q7r)
install(FILES ${COMPLETIONS}/q7r.fish DESTINATION ${CMAKE_INSTALL_DATADIR}/fish/vendor_completions.d)

if(TORVANE_BUILD_MANUAL)
  find_program(HELP2MAN help2man REQUIRED)
  add_custom_command(OUTPUT ${PROJECT_BINARY_DIR}/manual/q7r.1.gz
    COMMAND ${PROJECT_SOURCE_DIR}/packaging/debian/write-manual $<TARGET_FILE:q7r> ${PROJECT_BINARY_DIR}/manual
    DEPENDS q7r ${PROJECT_SOURCE_DIR}/packaging/debian/write-manual COMMENT "Writing the manual pages" VERBATIM)
  add_custom_target(manual ALL DEPENDS ${PROJECT_BINARY_DIR}/manual/q7r.1.gz)
  install(DIRECTORY ${PROJECT_BINARY_DIR}/manual/ DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 FILES_MATCHING PATTERN "*.gz")
endif()

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME torvane)
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "") # each package has its own
set(CPACK_PACKAGE_VENDOR "the torvane developers")
set(CPACK_PACKAGE_CONTACT "the torvane developers <developers@torvane.example>")
set(CPACK_STRIP_FILES ON)
set(CPACK_COMPONENTS_ALL program development)
set(CPACK_COMPONENTS_GROUPING IGNORE)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_PROGRAM_PACKAGE_NAME q7r)
set(CPACK_DEBIAN_PROGRAM_PACKAGE_SECTION graphics)
set(CPACK_DEBIAN_PROGRAM_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PROGRAM_DESCRIPTION "After Effects compositions as 3D scene files
Exports compositions of After Effects projects, with cameras, lights, image
planes and animation, into .q7r scene files, without After Effects. Looks
into scene files, checks and merges them, and writes them as glTF.")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libtorvane-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS "libjpeg62-turbo-dev | libjpeg-dev, libstdc++-12-dev | libstdc++-dev")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SUGGESTS "cmake, pkgconf")
set(CPACK_DEBIAN_DEVELOPMENT_DESCRIPTION "library for .q7r scene files
Reads scene files of every version and writes the current one. Headers,
static libraries, and files for CMake and pkg-config.")
set(CPACK_SOURCE_GENERATOR TGZ)
set(CPACK_SOURCE_PACKAGE_FILE_NAME torvane-${PROJECT_VERSION})
set(CPACK_SOURCE_IGNORE_FILES "/build/" "/out/" "/\\\\.git(/|$)" "/\\\\.cache/" "\\\\.q7r$" "\\\\.log$")

# What Debian wants of every package: its licence and its changes.
string(TIMESTAMP CHANGELOG_DATE "%a, %d %b %Y %H:%M:%S +0000" UTC)
configure_file(packaging/debian/changelog.in changelog @ONLY)
find_program(GZIP gzip)
if(GZIP)
  add_custom_command(OUTPUT changelog.gz COMMAND ${GZIP} -9nkf changelog DEPENDS ${PROJECT_BINARY_DIR}/changelog)
  add_custom_target(packed_changelog ALL DEPENDS ${PROJECT_BINARY_DIR}/changelog.gz)
endif()
foreach(package program development)
  string(TOUPPER ${package} PACKAGE)
  set(folder ${CMAKE_INSTALL_DATADIR}/doc/${CPACK_DEBIAN_${PACKAGE}_PACKAGE_NAME})
  install(FILES ${PROJECT_SOURCE_DIR}/packaging/debian/copyright DESTINATION ${folder} COMPONENT ${package})
  install(FILES ${PROJECT_BINARY_DIR}/changelog.gz DESTINATION ${folder} COMPONENT ${package} OPTIONAL)
endforeach()
include(CPack)
