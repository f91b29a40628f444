# Reading the dynamic symbol table of a shared object with nm.

# Lines of nm's portable form: "name[@version] type ...".
function(velk_read_symbols out)
  execute_process(COMMAND ${NM} --dynamic --format=posix ${ARGN} ${LIBRARY}
                  OUTPUT_VARIABLE text RESULT_VARIABLE failed)
  if(failed)
    message(FATAL_ERROR "${NM} cannot read ${LIBRARY}")
  endif()
  string(REGEX MATCHALL "[^\n]+" lines "${text}")
  set(${out} "${lines}" PARENT_SCOPE)
endfunction()

# Ends the script with all complaints at once, or quietly when there is none.
function(velk_report subject)
  if(ARGN)
    list(JOIN ARGN "\n  " complaints)
    message(FATAL_ERROR "${subject}:\n  ${complaints}\n")
  endif()
endfunction()
