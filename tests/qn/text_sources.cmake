# Tests of text comparison, code pages, numbers and GUIDs.
set(QN_TEXT_TESTS
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/CompareTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/Compare_linuxTest.cpp)
