# What writes the tree, and who owns it.
set(RESTREE_WRITER_TESTS
  ${CMAKE_CURRENT_LIST_DIR}/ResTreeOwnerTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/TreeWriterTest.cpp)
