# The tool with allocations and file operations failing. A program of its own: here the ordinary heap can fail too.
zkfpga_add_test(cachebuilder_failure_tests
  ${CMAKE_CURRENT_LIST_DIR}/AllocationFailureTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/FileFailureTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/SmallInstallation.cpp
  ${PROJECT_SOURCE_DIR}/tests/support/CountedNew.cpp
  ${PROJECT_SOURCE_DIR}/tests/support/FaultyFileSystem.cpp
  ${PROJECT_SOURCE_DIR}/tests/support/TemporaryFolder_linux.cpp)
