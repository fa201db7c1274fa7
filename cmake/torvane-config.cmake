# find_package(torvane) gives the target torvane::torvane. The library leaves its client hooks (torvane/hooks.h)
# undefined: the program that links it supplies them.
include(CMakeFindDependencyMacro)
find_dependency(JPEG)
include(${CMAKE_CURRENT_LIST_DIR}/torvane-targets.cmake)
