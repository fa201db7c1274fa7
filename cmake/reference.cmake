# `cmake --build BUILD --target reference` writes the library's reference from its headers to BUILD/reference/html. Needs
# Doxygen; a warning of it is an error.
find_program(DOXYGEN doxygen)
mark_as_advanced(DOXYGEN)
if(DOXYGEN)
  configure_file(${PROJECT_SOURCE_DIR}/docs/Doxyfile.in ${PROJECT_BINARY_DIR}/Doxyfile @ONLY)
  add_custom_target(reference COMMAND ${DOXYGEN} -q ${PROJECT_BINARY_DIR}/Doxyfile
    COMMENT "Writing ${PROJECT_BINARY_DIR}/reference/html/index.html" VERBATIM)
else()
  add_custom_target(reference COMMAND ${CMAKE_COMMAND} -E echo "doxygen is not installed: no reference is written")
endif()
