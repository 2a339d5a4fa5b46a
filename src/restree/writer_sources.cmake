# What writes the tree, and who owns it.
target_sources(zkfpga PRIVATE
  ${CMAKE_CURRENT_LIST_DIR}/ResTreeOwner.cpp
  ${CMAKE_CURRENT_LIST_DIR}/TreeWriter.cpp)
