# Installs the build into an empty folder, then configures, builds and runs the client against nothing but that folder,
# and runs the installed program.
function(run)
  execute_process(COMMAND ${ARGV} COMMAND_ECHO STDOUT COMMAND_ERROR_IS_FATAL ANY)
endfunction()

set(prefix ${WORK_DIR}/prefix)
set(client ${WORK_DIR}/client)
if(SANITIZE)
  set(flags -fsanitize=${SANITIZE})
endif()

file(REMOVE_RECURSE ${WORK_DIR})
run(${CMAKE_COMMAND} --install ${BUILD_DIR} --prefix ${prefix})
run(${CMAKE_COMMAND} -S ${CMAKE_CURRENT_LIST_DIR}/client -B ${client} -G Ninja
  -D CMAKE_BUILD_TYPE=Release -D CMAKE_CXX_COMPILER=${COMPILER} -D CMAKE_CXX_FLAGS=${flags}
  -D CMAKE_PREFIX_PATH=${prefix})
run(${CMAKE_COMMAND} --build ${client})
run(${client}/client ${WORK_DIR}/scene.q7r)
run(${prefix}/bin/q7r --version)
