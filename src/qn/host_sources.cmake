# Sources that deal with the process itself, its modules, and what it exchanges with a host.
target_sources(zkfpga PRIVATE
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/BoundaryMemory_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/CriticalSection_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/DebugTrap_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/FatalError_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/Module_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/zk/ThrowIfZKError.cpp)
target_link_libraries(zkfpga PRIVATE ${CMAKE_DL_LIBS})
