# Windows x86-64 by Debian's cross compiler, with what scripts/setup-windows has made ready in its cache folder: libexpat
# and GoogleTest built for Windows, and the Wine prefix that scripts/wine runs programs in.
set(CMAKE_SYSTEM_NAME Windows)
set(CMAKE_SYSTEM_PROCESSOR x86_64)

# The flavour with POSIX threads: std::thread and std::mutex need it.
set(CMAKE_C_COMPILER x86_64-w64-mingw32-gcc-posix)
set(CMAKE_CXX_COMPILER x86_64-w64-mingw32-g++-posix)
set(CMAKE_RC_COMPILER x86_64-w64-mingw32-windres)

# The run-time libraries of the compiler go into each program: it needs nothing but the system.
set(CMAKE_EXE_LINKER_FLAGS_INIT -static)
set(CMAKE_SHARED_LINKER_FLAGS_INIT -static)
set(CMAKE_MODULE_LINKER_FLAGS_INIT -static)

if(NOT "$ENV{XDG_CACHE_HOME}" STREQUAL "")
  set(ZKFPGA_WINDOWS_CACHE "$ENV{XDG_CACHE_HOME}/zkfpga-windows")
else()
  set(ZKFPGA_WINDOWS_CACHE "$ENV{HOME}/.cache/zkfpga-windows")
endif()
set(CMAKE_FIND_ROOT_PATH "${ZKFPGA_WINDOWS_CACHE}/libraries")
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)

set(CMAKE_CROSSCOMPILING_EMULATOR "${CMAKE_CURRENT_LIST_DIR}/../../scripts/wine")
