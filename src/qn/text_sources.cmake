# Sources of text comparison, code pages, numbers and GUIDs.
target_sources(zkfpga PRIVATE
  ${CMAKE_CURRENT_LIST_DIR}/dsc/Guid.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/AnsiToWide_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/CodePage932_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/Compare_ascii.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/Compare_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/IntegerToString.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/StringToInteger.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/WideToAnsi_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/_GetCodePageID.cpp)
