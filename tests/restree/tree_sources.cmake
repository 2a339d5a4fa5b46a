# The node and its entries.
set(RESTREE_TREE_TESTS
  ${CMAKE_CURRENT_LIST_DIR}/DeepTreeTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/DeferredLoadTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/EntryListTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ManyObserversTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ObserverTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ResTreeNodeChangesTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ResTreeNodeCopyTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ResTreeNodeEntriesTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ResTreeNodePathTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ResTreeNodeRemovalTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ResTreeNodeTypesTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ReservationModelTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ReservationObserverTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ReservationWalkTest.cpp
  ${CMAKE_CURRENT_LIST_DIR}/ReservationsTest.cpp)
