# A developer's view of what is installed: the library for developers goes into an empty folder, which then is moved. The
# client with hooks of its own, and the program that the README shows, are built and run against nothing but that folder,
# by CMake and by pkg-config. Run by ctest; TOP is the source tree.
function(run)
  execute_process(COMMAND ${ARGV} COMMAND_ECHO STDOUT COMMAND_ERROR_IS_FATAL ANY)
endfunction()

# Configures and builds SOURCE in BUILD.
function(build source build)
  run(${CMAKE_COMMAND} -S ${source} -B ${build} -G Ninja -D CMAKE_BUILD_TYPE=Release -D CMAKE_CXX_COMPILER=${COMPILER}
    -D CMAKE_CXX_FLAGS=${flags} -D CMAKE_PREFIX_PATH=${prefix})
  run(${CMAKE_COMMAND} --build ${build})
endfunction()

# Writes the README's block of a language that begins with a text to a file.
function(write_block language first file)
  file(READ ${TOP}/README.md readme)
  string(FIND "${readme}" "```${language}\n${first}" start)
  if(start EQUAL -1)
    message(FATAL_ERROR "README.md has no block that begins with ${first}")
  endif()
  string(LENGTH "```${language}\n" head)
  math(EXPR start "${start} + ${head}")
  string(SUBSTRING "${readme}" ${start} -1 block)
  string(FIND "${block}" "\n```" end)
  string(SUBSTRING "${block}" 0 ${end} block)
  file(WRITE ${file} "${block}\n")
endfunction()

# The program prints what it has to.
function(expect_objects program)
  execute_process(COMMAND ${program} ${WORK_DIR}/scene.q7r OUTPUT_VARIABLE text COMMAND_ERROR_IS_FATAL ANY)
  if(NOT text MATCHES "^from a client \\(0, 0, 0\\)\n[^\n]*\\(0, 0, 0\\)\n[^\n]*\\(0, 0, 0\\)\n$")
    message(FATAL_ERROR "${program} printed ${text}")
  endif()
endfunction()

if(SANITIZE)
  set(flags -fsanitize=${SANITIZE})
endif()
set(prefix ${WORK_DIR}/prefix)
file(REMOVE_RECURSE ${WORK_DIR})
run(${CMAKE_COMMAND} --install ${BUILD_DIR} --prefix ${WORK_DIR}/first --component development)
file(RENAME ${WORK_DIR}/first ${prefix})

build(${CMAKE_CURRENT_LIST_DIR}/client ${WORK_DIR}/client)
run(${WORK_DIR}/client/client ${WORK_DIR}/scene.q7r)

set(source ${WORK_DIR}/readme)
write_block(cpp "#include <cstdio>" ${source}/objects.cpp)
write_block(cmake "cmake_minimum_required" ${source}/CMakeLists.txt)
build(${source} ${source}/build)
expect_objects(${source}/build/objects)

file(READ ${source}/CMakeLists.txt text)
string(REPLACE "COMPONENTS client" "COMPONENTS client paint" text "${text}")
file(WRITE ${WORK_DIR}/unknown/CMakeLists.txt "${text}")
execute_process(COMMAND ${CMAKE_COMMAND} -S ${WORK_DIR}/unknown -B ${WORK_DIR}/unknown/build -G Ninja
  -D CMAKE_CXX_COMPILER=${COMPILER} -D CMAKE_PREFIX_PATH=${prefix} ERROR_VARIABLE text RESULT_VARIABLE status)
if(status EQUAL 0 OR NOT text MATCHES "no component \"paint\"")
  message(FATAL_ERROR "an unknown component was not refused: ${text}")
endif()

find_program(PKG_CONFIG pkg-config)
if(PKG_CONFIG)
  file(GLOB_RECURSE pc ${prefix}/*/torvane-client.pc)
  cmake_path(GET pc PARENT_PATH folder)
  execute_process(COMMAND ${CMAKE_COMMAND} -E env PKG_CONFIG_PATH=${folder} ${PKG_CONFIG} --cflags --libs torvane-client
    OUTPUT_VARIABLE arguments OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
  separate_arguments(arguments)
  run(${COMPILER} ${flags} ${source}/objects.cpp -o ${source}/objects ${arguments})
  expect_objects(${source}/objects)
endif()

# The library asks for no type information and throws nothing.
find_program(NM nm)
if(NM AND NOT SANITIZE)
  file(GLOB_RECURSE library ${prefix}/*/libtorvane.a)
  execute_process(COMMAND ${NM} --undefined-only ${library} OUTPUT_VARIABLE text ERROR_QUIET)
  if(text MATCHES "__dynamic_cast|__cxa_throw|__cxa_bad_typeid" OR NOT text MATCHES "AllocNodeData")
    message(FATAL_ERROR "${library} asks for ${CMAKE_MATCH_0}")
  endif()
endif()

# The library alone wants nothing but libjpeg.
run(${CMAKE_COMMAND} -S ${TOP} -B ${WORK_DIR}/alone -G Ninja -D CMAKE_CXX_COMPILER=${COMPILER} -D TORVANE_LIBRARY_ONLY=ON
  -D CMAKE_DISABLE_FIND_PACKAGE_CLI11=ON -D CMAKE_DISABLE_FIND_PACKAGE_nlohmann_json=ON
  -D CMAKE_DISABLE_FIND_PACKAGE_pugixml=ON -D CMAKE_DISABLE_FIND_PACKAGE_GTest=ON)
