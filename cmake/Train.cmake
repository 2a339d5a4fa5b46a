# Runs TOOL on a copy of EXAMPLE and on what GENERATOR, a script for PYTHON, lays out, both below WORK, and puts the counts
# that it leaves in COUNTERS beside the OBJECTS of the same sources. STAMP changes with the counts only, so that nothing
# is compiled anew for the same ones.
file(REMOVE_RECURSE ${WORK})
file(COPY ${EXAMPLE}/ DESTINATION ${WORK}/example)
execute_process(COMMAND ${PYTHON} ${GENERATOR} ${WORK}/generated --megabytes 1 --targets 10 COMMAND_ERROR_IS_FATAL ANY)

# Counts add up over runs.
file(GLOB_RECURSE old_counts ${COUNTERS}/*.gcda)
if(old_counts)
  file(REMOVE ${old_counts})
endif()
get_filename_component(name ${TOOL} NAME)
foreach(installation IN ITEMS example generated)
  set(utilities ${WORK}/${installation}/Targets/QN/FPGA/Utilities)
  file(COPY ${TOOL} DESTINATION ${utilities})
  execute_process(COMMAND ${utilities}/${name} RESULT_VARIABLE status)
  if(NOT status EQUAL 0)
    message(FATAL_ERROR "The tool ended with ${status} on ${WORK}/${installation}.")
  endif()
endforeach()

file(GLOB_RECURSE counts RELATIVE ${COUNTERS} ${COUNTERS}/*.gcda)
set(digests "")
foreach(count IN LISTS counts)
  get_filename_component(folder ${OBJECTS}/${count} DIRECTORY)
  file(COPY ${COUNTERS}/${count} DESTINATION ${folder})
  file(SHA256 ${COUNTERS}/${count} digest)
  string(APPEND digests "${digest} ${count}\n")
endforeach()
if(NOT counts)
  message(FATAL_ERROR "The tool left no counts in ${COUNTERS}.")
endif()
file(CONFIGURE OUTPUT ${STAMP} CONTENT "${digests}" @ONLY)
