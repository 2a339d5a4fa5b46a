# Tests of text lists and node paths.
set(RESTREE_TEXT_TESTS
  ${CMAKE_CURRENT_LIST_DIR}/NodePathTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/TextListTest.cpp)
