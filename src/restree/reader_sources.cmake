# The reader: from a document's events to calls on the tree.
target_sources(zkfpga PRIVATE
  ${CMAKE_CURRENT_LIST_DIR}/AttributeList.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ElementName.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ElementReader.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ExPatHandler.cpp
  ${CMAKE_CURRENT_LIST_DIR}/Instances.cpp
  ${CMAKE_CURRENT_LIST_DIR}/LoadChain.cpp
  ${CMAKE_CURRENT_LIST_DIR}/LocalizeText.cpp
  ${CMAKE_CURRENT_LIST_DIR}/NameRange.cpp
  ${CMAKE_CURRENT_LIST_DIR}/OpenAttributes.cpp
  ${CMAKE_CURRENT_LIST_DIR}/OpenElementParameters.cpp
  ${CMAKE_CURRENT_LIST_DIR}/Parameters.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ParseStack.cpp)
