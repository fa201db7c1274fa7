# compile_apart(SOURCE...): those of the files that include headers of Windows are never compiled together with others,
# since these headers make macros of plain words.
function(compile_apart)
  foreach(source ${ARGN})
    file(STRINGS ${source} found REGEX "^#include <(windows|winsock2)\\.h>")
    if(found)
      set_source_files_properties(${source} PROPERTIES SKIP_UNITY_BUILD_INCLUSION ON)
    endif()
  endforeach()
endfunction()
