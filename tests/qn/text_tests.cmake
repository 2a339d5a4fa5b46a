# Comparison, code pages, numbers and GUIDs.
set(QN_TEXT_TESTS
  dsc/osdep/CompareTest.cpp
  dsc/osdep/Compare_linuxTest.cpp
)
