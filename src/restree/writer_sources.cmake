# What writes the tree.
target_sources(zkfpga PRIVATE ${CMAKE_CURRENT_LIST_DIR}/TreeWriter.cpp)
