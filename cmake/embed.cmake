# Files that become part of a program: neither it nor its users look for them.
set(EMBED_SCRIPT ${CMAKE_CURRENT_LIST_DIR}/embed_file.cmake)

# embed_file(TARGET FILE FUNCTION HEADER): FUNCTION, a full name that HEADER declares, gives the bytes of FILE as a
# std::string_view.
function(embed_file target file function header)
  cmake_path(ABSOLUTE_PATH file OUTPUT_VARIABLE input)
  cmake_path(GET file FILENAME name)
  set(output ${CMAKE_CURRENT_BINARY_DIR}/embedded/${name}.cpp)
  add_custom_command(OUTPUT ${output}
    COMMAND ${CMAKE_COMMAND} -D INPUT=${input} -D OUTPUT=${output} -D FUNCTION=${function} -D HEADER=${header}
      -P ${EMBED_SCRIPT}
    DEPENDS ${input} ${EMBED_SCRIPT}
    COMMENT "Embedding ${name}"
    VERBATIM)
  target_sources(${target} PRIVATE ${output})
  set_source_files_properties(${output} PROPERTIES SKIP_UNITY_BUILD_INCLUSION ON)
endfunction()
