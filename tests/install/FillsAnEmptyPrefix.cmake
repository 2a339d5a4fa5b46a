# Installs what has been built into an empty folder.
include(settings.cmake)
file(REMOVE_RECURSE ${prefix})
execute_process(COMMAND ${CMAKE_COMMAND} --install ${build_folder} --prefix ${prefix} COMMAND_ERROR_IS_FATAL ANY)
