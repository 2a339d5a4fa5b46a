# Sources of paths, files and native names.
target_sources(zkfpga PRIVATE
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/NativeText.cpp)
