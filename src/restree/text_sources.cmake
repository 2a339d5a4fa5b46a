# Text lists and node paths.
target_sources(zkfpga PRIVATE
  ${CMAKE_CURRENT_LIST_DIR}/NodePath.cpp
  ${CMAKE_CURRENT_LIST_DIR}/TextList.cpp)
