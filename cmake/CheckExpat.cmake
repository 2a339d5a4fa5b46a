# Warns where the libexpat that all resource files go through is older than the fixes that are known to matter.

# Whether a libexpat is too old: its own version, and the version of the package that it comes from, empty if it comes
# from none. Debian 12 mends its 2.5.0 in place, which shows in the package alone.
function(zkfpga_is_expat_old version package result)
  set(isOld OFF)
  if(package MATCHES "\\+deb12u([0-9]+)")
    if(CMAKE_MATCH_1 LESS 5)
      set(isOld ON)
    endif()
  elseif(version VERSION_LESS 2.8.4)
    set(isOld ON)
  endif()
  set(${result} ${isOld} PARENT_SCOPE)
endfunction()

# The version of the package that libexpat's library comes from, where Debian's tools know it.
function(zkfpga_find_expat_package result)
  set(${result} "" PARENT_SCOPE)
  find_program(ZKFPGA_DPKG_QUERY dpkg-query)
  mark_as_advanced(ZKFPGA_DPKG_QUERY)
  if(ZKFPGA_DPKG_QUERY AND NOT CMAKE_CROSSCOMPILING)
    execute_process(COMMAND ${ZKFPGA_DPKG_QUERY} --show "--showformat=\${Version}" libexpat1
      OUTPUT_VARIABLE package ERROR_QUIET RESULT_VARIABLE status)
    if(status EQUAL 0)
      set(${result} ${package} PARENT_SCOPE)
    endif()
  endif()
endfunction()

function(zkfpga_warn_of_old_expat version)
  zkfpga_find_expat_package(package)
  zkfpga_is_expat_old("${version}" "${package}" isOld)
  if(isOld)
    message(WARNING "libexpat ${version} (${package}) has known faults that a resource file can reach: "
      "take 2.5.0-1+deb12u5 or later on Debian 12, 2.8.4 or later elsewhere.")
  endif()
endfunction()
