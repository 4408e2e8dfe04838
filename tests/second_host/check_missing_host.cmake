# The library leaves its host's services undefined: linking without a host must fail for that
# reason, and must succeed with one.
set(program ${folder}/one_call)
get_filename_component(library_folder ${library} DIRECTORY)
set(link ${compiler} -std=c++20 ${flags} -I${include} ${source} -o ${program}
    ${library} -Wl,-rpath,${library_folder})

execute_process(COMMAND ${link} RESULT_VARIABLE status ERROR_VARIABLE output)
if(status EQUAL 0)
  message(FATAL_ERROR "a program without a host links")
endif()
if(NOT output MATCHES "undefined reference to .*vxMemoryAllocateOrRaise")
  message(FATAL_ERROR "linking without a host fails for another reason:\n${output}")
endif()

execute_process(COMMAND ${link} ${host} COMMAND_ERROR_IS_FATAL ANY)
execute_process(COMMAND ${program} COMMAND_ERROR_IS_FATAL ANY)
