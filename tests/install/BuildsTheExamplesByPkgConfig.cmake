# Builds the installed example programs by the line that stands at the head of each.
include(settings.cmake)
set(ENV{PKG_CONFIG_PATH} ${prefix}/${libdir}/pkgconfig)
execute_process(COMMAND ${pkg_config} --cflags --libs zkfpga OUTPUT_VARIABLE package OUTPUT_STRIP_TRAILING_WHITESPACE
  COMMAND_ERROR_IS_FATAL ANY)
separate_arguments(package UNIX_COMMAND ${package})

if(system STREQUAL "Windows")
  set(exporting -Wl,--export-all-symbols)
  set(text_type -DWCHAR=char16_t -D__WCHAR_DEFINED -D__STRALIGN_H_)
  list(APPEND package ${link_options})
  set(resources ${programs}/pkg-config/browse/browse.res.o)
else()
  set(exporting -rdynamic)
  set(resources "")
  set(text_type "")
  # The installation isn't where the loader looks by itself.
  list(APPEND package -Wl,-rpath,${prefix}/${libdir})
endif()
foreach(program browse reserve)
  file(REMOVE_RECURSE ${programs}/pkg-config/${program})
  file(MAKE_DIRECTORY ${programs}/pkg-config/${program})
endforeach()
if(resources)
  execute_process(COMMAND ${rc_compiler} browse.rc ${resources}
    WORKING_DIRECTORY ${prefix}/${docdir}/examples/browse COMMAND_ERROR_IS_FATAL ANY)
endif()
execute_process(COMMAND ${c_compiler} -std=c99 ${c_options} ${exporting} browse.c runtime.c ${resources} ${package}
  -o ${programs}/pkg-config/browse/browse${suffix} WORKING_DIRECTORY ${prefix}/${docdir}/examples/browse
  COMMAND_ERROR_IS_FATAL ANY)
execute_process(COMMAND ${cxx_compiler} -std=c++20 ${cxx_options} ${text_type} reserve.cpp ${package}
  -o ${programs}/pkg-config/reserve/reserve${suffix} WORKING_DIRECTORY ${prefix}/${docdir}/examples/reserve
  COMMAND_ERROR_IS_FATAL ANY)
