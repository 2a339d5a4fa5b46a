# Builds the installed example programs by the line that stands at the head of each.
include(settings.cmake)
set(ENV{PKG_CONFIG_PATH} ${prefix}/${libdir}/pkgconfig)
execute_process(COMMAND ${pkg_config} --cflags --libs zkfpga OUTPUT_VARIABLE package OUTPUT_STRIP_TRAILING_WHITESPACE
  COMMAND_ERROR_IS_FATAL ANY)
separate_arguments(package UNIX_COMMAND ${package})

# The installation isn't where the loader looks by itself.
set(package ${package} -Wl,-rpath,${prefix}/${libdir})
foreach(program browse reserve)
  file(REMOVE_RECURSE ${programs}/pkg-config/${program})
  file(MAKE_DIRECTORY ${programs}/pkg-config/${program})
endforeach()
execute_process(COMMAND ${c_compiler} -std=c99 ${c_options} -rdynamic browse.c runtime.c ${package}
  -o ${programs}/pkg-config/browse/browse WORKING_DIRECTORY ${prefix}/${docdir}/examples/browse
  COMMAND_ERROR_IS_FATAL ANY)
execute_process(COMMAND ${cxx_compiler} -std=c++20 ${cxx_options} reserve.cpp ${package}
  -o ${programs}/pkg-config/reserve/reserve WORKING_DIRECTORY ${prefix}/${docdir}/examples/reserve
  COMMAND_ERROR_IS_FATAL ANY)
