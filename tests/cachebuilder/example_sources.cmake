# The installation in examples/, and the page on its cache.
set(CACHEBUILDER_EXAMPLE_TESTS ${CMAKE_CURRENT_LIST_DIR}/ExampleInstallationTest.cpp)
set_source_files_properties(${CMAKE_CURRENT_LIST_DIR}/ExampleInstallationTest.cpp PROPERTIES
  COMPILE_DEFINITIONS ZKFPGA_SOURCE_DIR="${PROJECT_SOURCE_DIR}")
