# With ZKFPGA_TRAIN the compiler lays the code of the library out by what two runs of the tool did, on the example
# installation and on a generated one of larger descriptions: which branches are usual, what is called most and belongs
# together. For that the same sources are compiled twice, first with counters in a build of their own, whose counts are
# then put beside the objects here. The two have to be called alike within their builds, since GCC knows a function by
# the name of its object.
include_guard()

if(NOT CMAKE_CXX_COMPILER_ID STREQUAL "GNU" OR CMAKE_CROSSCOMPILING)
  message(FATAL_ERROR "ZKFPGA_TRAIN needs GCC and a tool that runs where it is built.")
endif()

find_package(Python3 REQUIRED COMPONENTS Interpreter)
include(ExternalProject)
set(training_folder ${CMAKE_BINARY_DIR}/training)
set(training_stamp ${training_folder}/counts.txt)
set(counting_tool ${training_folder}/build/bin/zkfpga_make_resource_cache)
ExternalProject_Add(zkfpga_counting
  SOURCE_DIR ${PROJECT_SOURCE_DIR}
  PREFIX ${training_folder}
  BINARY_DIR ${training_folder}/build
  CMAKE_ARGS
    -D CMAKE_BUILD_TYPE=${CMAKE_BUILD_TYPE}
    -D CMAKE_CXX_COMPILER=${CMAKE_CXX_COMPILER}
    -D CMAKE_CXX_COMPILER_LAUNCHER=${CMAKE_CXX_COMPILER_LAUNCHER}
    -D CMAKE_CXX_FLAGS=${CMAKE_CXX_FLAGS}
    -D CMAKE_CXX_FLAGS_RELEASE=${CMAKE_CXX_FLAGS_RELEASE}
    -D BUILD_TESTING=OFF
    -D ZKFPGA_COUNTERS=ON
  BUILD_COMMAND ${CMAKE_COMMAND} --build <BINARY_DIR> --target zkfpga_make_resource_cache
  BUILD_ALWAYS ON
  BUILD_BYPRODUCTS ${counting_tool}
  INSTALL_COMMAND ""
  EXCLUDE_FROM_ALL ON)

set(generator ${PROJECT_SOURCE_DIR}/bench/MakeInstallation.py)
file(GLOB_RECURSE example_files CONFIGURE_DEPENDS ${PROJECT_SOURCE_DIR}/examples/installation/*)
add_custom_command(
  OUTPUT ${training_stamp}
  COMMAND ${CMAKE_COMMAND}
    -D TOOL=${counting_tool}
    -D EXAMPLE=${PROJECT_SOURCE_DIR}/examples/installation
    -D PYTHON=${Python3_EXECUTABLE}
    -D GENERATOR=${generator}
    -D WORK=${training_folder}/installations
    -D COUNTERS=${training_folder}/build/CMakeFiles/zkfpga.dir
    -D OBJECTS=${CMAKE_BINARY_DIR}/CMakeFiles/zkfpga.dir
    -D STAMP=${training_stamp}
    -P ${PROJECT_SOURCE_DIR}/cmake/Train.cmake
  DEPENDS ${counting_tool} zkfpga_counting ${PROJECT_SOURCE_DIR}/cmake/Train.cmake ${generator} ${example_files}
  COMMENT "Running the tool on two installations for its counts"
  VERBATIM)
add_custom_target(zkfpga_train DEPENDS ${training_stamp})

# What the run didn't reach is compiled as it would be without it. The objects hold what optimisation at link time needs
# beside their code: programs with the property ZKFPGA_LINK_TIME_OPTIMIZATION are made from the one, all others, which
# are many and of no hurry, from the other. At link time a program is one piece that could have data of other libraries
# copied into itself, and would export them then; -mno-direct-extern-access leaves them where they are.
get_target_property(trained_sources zkfpga SOURCES)
set_source_files_properties(${trained_sources} TARGET_DIRECTORY zkfpga PROPERTIES
  COMPILE_OPTIONS "-O3;-flto;-ffat-lto-objects;-fprofile-use;-fprofile-partial-training;-Wno-missing-profile"
  OBJECT_DEPENDS ${training_stamp})
add_dependencies(zkfpga zkfpga_train)
target_link_options(zkfpga INTERFACE
  "$<IF:$<BOOL:$<TARGET_PROPERTY:ZKFPGA_LINK_TIME_OPTIMIZATION>>,-flto=auto;-mno-direct-extern-access,-fno-lto>")
