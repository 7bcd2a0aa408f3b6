# What the scripts that run the real wbhost executable share. WBHOST is its path.

# Runs wbhost with ARGN; fails unless it exits with EXPECTED ("usage": 64, a refused command
# line). Leaves stdout in OUT, stderr in ERR.
function(run_wbhost expected)
  execute_process(COMMAND ${WBHOST} ${ARGN} OUTPUT_VARIABLE out ERROR_VARIABLE err
                  RESULT_VARIABLE rc)
  if(expected STREQUAL "usage")
    set(expected 64)
  endif()
  if(NOT rc STREQUAL "${expected}")
    message(FATAL_ERROR "wbhost ${ARGN}: exit ${rc}, expected ${expected}\n${out}\n${err}")
  endif()
  set(OUT "${out}" PARENT_SCOPE)
  set(ERR "${err}" PARENT_SCOPE)
endfunction()

# Fails unless TEXT contains every one of ARGN.
function(expect_all text)
  foreach(piece IN LISTS ARGN)
    string(FIND "${text}" "${piece}" at)
    if(at EQUAL -1)
      message(FATAL_ERROR "missing \"${piece}\" in:\n${text}")
    endif()
  endforeach()
endfunction()
