# Options that every target of ours is built with, as the interface library zkfpga_options.
add_library(zkfpga_options INTERFACE)
target_compile_options(zkfpga_options INTERFACE
  -Wall -Wextra -Wpedantic -Werror -Wconversion -Wsign-conversion
  -Wnon-virtual-dtor -Woverloaded-virtual -Wcast-align -Wformat=2 -Wundef)

# A constructor's parameter may bear the name of the field that it sets, which g++'s plain -Wshadow forbids.
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  target_compile_options(zkfpga_options INTERFACE -Wshadow=local)
else()
  target_compile_options(zkfpga_options INTERFACE -Wshadow)
endif()

if(WIN32)
  # Text is char16_t on Windows too: the system's headers leave WCHAR to who has defined it (and their few inline
  # functions for wchar_t must then be left out).
  target_compile_definitions(zkfpga_options INTERFACE
    WCHAR=char16_t __WCHAR_DEFINED __STRALIGN_H_ WIN32_LEAN_AND_MEAN NOMINMAX)
  # The system's IUnknown, base of every interface, has no destructor of its own.
  target_compile_options(zkfpga_options INTERFACE -Wno-non-virtual-dtor)
endif()

if(ZKFPGA_SANITIZE)
  target_compile_options(zkfpga_options INTERFACE
    -fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer)
  target_link_options(zkfpga_options INTERFACE -fsanitize=address,undefined)
endif()
if(ZKFPGA_COVERAGE)
  target_compile_options(zkfpga_options INTERFACE --coverage -fprofile-update=atomic)
  target_link_options(zkfpga_options INTERFACE --coverage)
  # Counters are written at the exit of a process: those that end otherwise have to be made to.
  add_library(zkfpga_counters STATIC ${PROJECT_SOURCE_DIR}/tests/support/CountersAtTheEnd_linux.c)
  target_link_libraries(zkfpga_options INTERFACE zkfpga_counters)
  target_link_options(zkfpga_options INTERFACE LINKER:--wrap=raise,--wrap=_Exit,--wrap=_exit)
endif()
