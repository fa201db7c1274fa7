# What every target of this tree is compiled with. Targets take it by linking torvane_options (private).
if(NOT CMAKE_BUILD_TYPE AND NOT CMAKE_CONFIGURATION_TYPES)
  set(CMAKE_BUILD_TYPE RelWithDebInfo CACHE STRING "Build type" FORCE)
endif()
set(CMAKE_CXX_STANDARD 20)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
# Debug information of the default type costs compile time and disk and is of no use in a release.
set(CMAKE_CXX_FLAGS_RELWITHDEBINFO "-O2 -g1 -DNDEBUG")

add_library(torvane_options INTERFACE)
target_compile_options(torvane_options INTERFACE
  -Wall -Wextra -Wpedantic -Wconversion -Wshadow -Werror)
# Classes are told apart by their kinds, not by their type information: the check of virtual tables is left out.
if(TORVANE_SANITIZE)
  target_compile_options(torvane_options INTERFACE
    -fsanitize=${TORVANE_SANITIZE} -fno-sanitize=vptr -fno-sanitize-recover=all -fno-omit-frame-pointer)
  target_link_options(torvane_options INTERFACE -fsanitize=${TORVANE_SANITIZE})
endif()
