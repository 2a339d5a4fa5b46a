# Sources of text comparison, code pages, numbers and GUIDs.
target_sources(zkfpga PRIVATE
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/Compare_ascii.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/Compare_linux.cpp)
