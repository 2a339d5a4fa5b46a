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

if(ZKFPGA_SANITIZE)
  target_compile_options(zkfpga_options INTERFACE
    -fsanitize=address,undefined -fno-sanitize-recover=all -fno-omit-frame-pointer)
  target_link_options(zkfpga_options INTERFACE -fsanitize=address,undefined)
endif()
if(ZKFPGA_COVERAGE)
  target_compile_options(zkfpga_options INTERFACE --coverage -fprofile-update=atomic)
  target_link_options(zkfpga_options INTERFACE --coverage)
endif()
