# Sources of paths, files and native names.
target_sources(zkfpga PRIVATE
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/BinaryFile.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/CommandLine_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/CopyDirectoryTree.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/FileFinder.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/FileSystem.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/FileSystem_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/FolderSearch_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/NameOrder_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/NativeFolder_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/NativePath_linux.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/NativeText.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/TextStream.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/TimeStamp.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/_GetExeFullPath.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/path.cpp
  ${CMAKE_CURRENT_LIST_DIR}/dsc/osdep/path_disk.cpp)
