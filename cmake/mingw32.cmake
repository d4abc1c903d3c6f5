# Cross-compiles for 32-bit Windows with MinGW-w64 GCC (posix threads):
#
#   cmake --preset windows                      # or, without presets:
#   cmake -S . -B build/windows -G Ninja -DCMAKE_TOOLCHAIN_FILE=cmake/mingw32.cmake
#
# Numbers are computed in SSE registers, as on Linux, so that both builds have the same results; hosts' stacks may be
# aligned to only 4 bytes, hence -mstackrealign.
set(CMAKE_SYSTEM_NAME Windows)
set(CMAKE_SYSTEM_PROCESSOR i686)
set(talutil_tool_prefix i686-w64-mingw32)
set(CMAKE_C_COMPILER i686-w64-mingw32-gcc-posix)
set(CMAKE_CXX_COMPILER i686-w64-mingw32-g++-posix)
set(CMAKE_RC_COMPILER i686-w64-mingw32-windres)
set(CMAKE_FIND_ROOT_PATH /usr/i686-w64-mingw32)
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)
set(talutil_windows_flags "-msse2 -mfpmath=sse -mstackrealign -ffunction-sections -fdata-sections")
set(CMAKE_C_FLAGS_INIT "${talutil_windows_flags}")
set(CMAKE_CXX_FLAGS_INIT "${talutil_windows_flags}")
