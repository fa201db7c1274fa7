# Debian's cross compiler for 64-bit Windows. What the build links or includes beyond it comes from one folder,
# WINDOWS_PREFIX, which packaging/windows/build fills; the headers and libraries of this machine are never looked at.
set(CMAKE_SYSTEM_NAME Windows)
set(CMAKE_SYSTEM_PROCESSOR x86_64)
set(CMAKE_C_COMPILER x86_64-w64-mingw32-gcc-posix)
set(CMAKE_CXX_COMPILER x86_64-w64-mingw32-g++-posix)
set(CMAKE_RC_COMPILER x86_64-w64-mingw32-windres)

list(APPEND CMAKE_TRY_COMPILE_PLATFORM_VARIABLES WINDOWS_PREFIX)
set(CMAKE_FIND_ROOT_PATH ${WINDOWS_PREFIX} /usr/x86_64-w64-mingw32)
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)
# The packages that are headers alone bring CMake files which name this machine's include folder; these don't.
list(APPEND CMAKE_MODULE_PATH ${CMAKE_CURRENT_LIST_DIR}/cmake)

# A plug-in must not ask for the compiler's libraries, and neither must the programs that try it.
# Programs get the stack that they have on Linux, for files that nest as deep as the library follows them.
set(CMAKE_EXE_LINKER_FLAGS_INIT "-static -Wl,--stack,8388608")
set(CMAKE_MODULE_LINKER_FLAGS_INIT "-static")
# The system's functions since Windows 10, which every After Effects in question needs.
set(CMAKE_C_FLAGS_INIT "-D_WIN32_WINNT=0x0A00")
# Without position-independent code this compiler inlines further and takes copies whose length it has lost sight of
# for overruns; the native builds, which look at the same code, keep the warning.
set(CMAKE_CXX_FLAGS_INIT "-D_WIN32_WINNT=0x0A00 -Wno-stringop-overflow")
# Nobody debugs these files here, and debug information takes half of the time.
set(CMAKE_C_FLAGS_RELEASE "-O2 -DNDEBUG" CACHE STRING "Flags of the release build")
set(CMAKE_CXX_FLAGS_RELEASE "-O2 -DNDEBUG" CACHE STRING "Flags of the release build")
