# Comparison, code pages, numbers and GUIDs.
set(QN_TEXT_TESTS
  dsc/GuidTest.cpp
  dsc/osdep/AnsiToWideTest.cpp
  dsc/osdep/CompareTest.cpp
  dsc/osdep/Compare_linuxTest.cpp
  dsc/osdep/IntegerToStringTest.cpp
  dsc/osdep/StringToIntegerTest.cpp
  dsc/osdep/WideToAnsiTest.cpp
  dsc/osdep/_GetCodePageIDTest.cpp
)
