# Builds the installed example programs as projects of their own, which find the library by find_package.
include(settings.cmake)
list(JOIN c_options " " c_flags)
list(JOIN cxx_options " " cxx_flags)
# As someone would say it who builds for another system without a toolchain file of ours.
set(target_system "")
if(cross_compiling)
  set(target_system -DCMAKE_SYSTEM_NAME=${system} -DCMAKE_RC_COMPILER=${rc_compiler}
    -DCMAKE_EXE_LINKER_FLAGS=${link_options})
endif()
foreach(program browse reserve)
  set(binaries ${programs}/cmake/${program})
  file(REMOVE_RECURSE ${binaries})
  execute_process(COMMAND ${CMAKE_COMMAND} -S ${prefix}/${docdir}/examples/${program} -B ${binaries} -G ${generator}
    -DCMAKE_PREFIX_PATH=${prefix} -DCMAKE_C_COMPILER=${c_compiler} -DCMAKE_CXX_COMPILER=${cxx_compiler}
    -DCMAKE_C_FLAGS=${c_flags} -DCMAKE_CXX_FLAGS=${cxx_flags} ${target_system} --no-warn-unused-cli COMMAND_ERROR_IS_FATAL ANY)
  execute_process(COMMAND ${CMAKE_COMMAND} --build ${binaries} COMMAND_ERROR_IS_FATAL ANY)
endforeach()
