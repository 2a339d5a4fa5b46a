# What reads resource files.
set(RESTREE_READER_TESTS
  ${CMAKE_CURRENT_LIST_DIR}/BadInputTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/DeferredLoadTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ElementNodesTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ElementValuesTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/IncludeTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/LinkTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/LoadResourceTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/LocalizeTextTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/NameRangeTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/NamesTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ParametersTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ParseErrorsTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/PrototypeTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ReadTree.cpp
  ${CMAKE_CURRENT_LIST_DIR}/XmlValueTest.cpp)
