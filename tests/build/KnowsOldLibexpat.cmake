# Which libexpats are warned of: the table of zkfpga_is_expat_old.
cmake_minimum_required(VERSION 3.25)
include(${CMAKE_CURRENT_LIST_DIR}/../../cmake/CheckExpat.cmake)

function(expect version package expected)
  zkfpga_is_expat_old("${version}" "${package}" isOld)
  if(NOT isOld STREQUAL expected)
    message(SEND_ERROR "libexpat ${version} (${package}): old is ${isOld}, not ${expected}")
  endif()
endfunction()

expect(2.5.0 "" ON)
expect(2.8.3 "" ON)
expect(2.8.4 "" OFF)
expect(2.10.0 "" OFF)
expect(3.0.0 "" OFF)
expect(2.5.0 2.5.0-1+deb12u1 ON)
expect(2.5.0 2.5.0-1+deb12u4 ON)
expect(2.5.0 2.5.0-1+deb12u5 OFF)
expect(2.5.0 2.5.0-1+deb12u12 OFF)
# Before the first of Debian's fixes the package has no such ending.
expect(2.5.0 2.5.0-1 ON)
expect(2.7.1 2.7.1-2 ON)
expect(2.8.4 2.8.4-1 OFF)
expect(2.8.4 2.8.4-1+b1 OFF)

# What stands beside a library that was built from a package goes before what the machine has.
set(folder ${CMAKE_CURRENT_BINARY_DIR}/expat-beside-its-version)
file(WRITE ${folder}/libexpat.version "2.5.0-1+deb12u3\n")
zkfpga_find_expat_package(${folder}/libexpat.a package)
if(NOT package STREQUAL "2.5.0-1+deb12u3")
  message(SEND_ERROR "the package of a library that was built from one is ${package}")
endif()
file(REMOVE_RECURSE ${folder})
