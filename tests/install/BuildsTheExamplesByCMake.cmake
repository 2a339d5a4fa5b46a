# Builds the installed example programs as projects of their own, which find the library by find_package.
include(settings.cmake)
list(JOIN c_options " " c_flags)
list(JOIN cxx_options " " cxx_flags)
foreach(program browse reserve)
  set(binaries ${programs}/cmake/${program})
  file(REMOVE_RECURSE ${binaries})
  execute_process(COMMAND ${CMAKE_COMMAND} -S ${prefix}/${docdir}/examples/${program} -B ${binaries} -G ${generator}
    -DCMAKE_PREFIX_PATH=${prefix} -DCMAKE_C_COMPILER=${c_compiler} -DCMAKE_CXX_COMPILER=${cxx_compiler}
    -DCMAKE_C_FLAGS=${c_flags} -DCMAKE_CXX_FLAGS=${cxx_flags} --no-warn-unused-cli COMMAND_ERROR_IS_FATAL ANY)
  execute_process(COMMAND ${CMAKE_COMMAND} --build ${binaries} COMMAND_ERROR_IS_FATAL ANY)
endforeach()
