# add_version_resource(TARGET TYPE FILE DESCRIPTION): on Windows, tells the version of a file in its properties. TYPE is 1
# for a program and 2 for a library.
function(add_version_resource target RESOURCE_FILE_TYPE RESOURCE_FILE RESOURCE_DESCRIPTION)
  if(NOT WIN32)
    return()
  endif()
  configure_file(${PROJECT_SOURCE_DIR}/packaging/windows/version.rc.in ${CMAKE_CURRENT_BINARY_DIR}/${target}_version.rc @ONLY)
  target_sources(${target} PRIVATE ${CMAKE_CURRENT_BINARY_DIR}/${target}_version.rc)
endfunction()
