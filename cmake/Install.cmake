# What an installation gets: the tool with its manual page; for hosts, the library, its headers, packages by which CMake
# and pkg-config find it, and the guide with its two example programs.
include(CMakePackageConfigHelpers)

install(TARGETS zkfpga_make_resource_cache)
install(TARGETS zkfpgarestree EXPORT zkfpga-targets)
install(DIRECTORY include/zkfpga TYPE INCLUDE FILES_MATCHING PATTERN "*.h")
install(FILES docs/zkfpga_make_resource_cache.1 DESTINATION ${CMAKE_INSTALL_MANDIR}/man1)

set(cmake_package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/zkfpga)
install(EXPORT zkfpga-targets NAMESPACE zkfpga:: DESTINATION ${cmake_package_dir} FILE zkfpgaTargets.cmake)
configure_package_config_file(cmake/zkfpgaConfig.cmake.in ${CMAKE_BINARY_DIR}/zkfpgaConfig.cmake
  INSTALL_DESTINATION ${cmake_package_dir})
write_basic_package_version_file(${CMAKE_BINARY_DIR}/zkfpgaConfigVersion.cmake COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_BINARY_DIR}/zkfpgaConfig.cmake ${CMAKE_BINARY_DIR}/zkfpgaConfigVersion.cmake
  DESTINATION ${cmake_package_dir})

install(FILES docs/host-guide.md docs/platforms.md TYPE DOC)
install(DIRECTORY examples/host/ DESTINATION ${CMAKE_INSTALL_DOCDIR}/examples)

# The folder of zkfpga.pc may lie at any depth: lib, lib64, lib/x86_64-linux-gnu.
file(RELATIVE_PATH pc_to_prefix ${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig ${CMAKE_INSTALL_PREFIX})
file(RELATIVE_PATH pc_to_include ${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig ${CMAKE_INSTALL_FULL_INCLUDEDIR})
# On Windows what a host calls for strings, memory and ids is the system's; and the library is named as a file, so that
# it is found by a linker that was told -static, too.
set(pc_libraries "-L\${libdir} -lzkfpgarestree")
if(WIN32)
  set(pc_libraries "\${libdir}/libzkfpgarestree.dll.a -lole32 -loleaut32 -luuid")
endif()
configure_file(cmake/zkfpga.pc.in ${CMAKE_BINARY_DIR}/zkfpga.pc @ONLY)
install(FILES ${CMAKE_BINARY_DIR}/zkfpga.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
