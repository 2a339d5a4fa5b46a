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

# The version of the package that `library` comes from: what stands beside it in libexpat.version (scripts/setup-windows
# writes that), otherwise that of the machine's own libexpat, where Debian's tools know it.
function(zkfpga_find_expat_package library result)
  set(${result} "" PARENT_SCOPE)
  get_filename_component(folder "${library}" DIRECTORY)
  find_program(ZKFPGA_DPKG_QUERY dpkg-query)
  mark_as_advanced(ZKFPGA_DPKG_QUERY)
  if(EXISTS "${folder}/libexpat.version")
    file(STRINGS "${folder}/libexpat.version" package LIMIT_COUNT 1)
    set(${result} "${package}" PARENT_SCOPE)
  elseif(ZKFPGA_DPKG_QUERY AND NOT CMAKE_CROSSCOMPILING)
    execute_process(COMMAND ${ZKFPGA_DPKG_QUERY} --show "--showformat=\${Version}" libexpat1
      OUTPUT_VARIABLE package ERROR_QUIET RESULT_VARIABLE status)
    if(status EQUAL 0)
      set(${result} "${package}" PARENT_SCOPE)
    endif()
  endif()
endfunction()

function(zkfpga_warn_of_old_expat version library)
  zkfpga_find_expat_package("${library}" package)
  zkfpga_is_expat_old("${version}" "${package}" isOld)
  if(isOld)
    set(origin "")
    if(package)
      set(origin ", as package ${package},")
    endif()
    message(WARNING "libexpat ${version}${origin} has known faults that a resource file can reach: "
      "take 2.5.0-1+deb12u5 or later on Debian 12, 2.8.4 or later elsewhere.")
  endif()
endfunction()
