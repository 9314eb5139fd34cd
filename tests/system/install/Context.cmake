# What the scripts of this folder share. -DTREE=... is where the installed tree is or will be.
cmake_minimum_required(VERSION 3.25)

# run(COMMAND...): its standard output in ${output}; anything but success ends the test.
function(run)
  execute_process(COMMAND ${ARGV} OUTPUT_VARIABLE output ECHO_ERROR_VARIABLE COMMAND_ERROR_IS_FATAL ANY)
  set(output "${output}" PARENT_SCOPE)
endfunction()

# expect_answers(PROGRAM): it answers from the database of the moved tree.
function(expect_answers program)
  run(${program})
  if(NOT output STREQUAL [[
KS50 is of family kestrel
Program
Verify
Vendor Korvel
No such property: DataNotFoundException at ../s/ConstraintsManager, line 437
]])
    message(FATAL_ERROR "${program} answers:\n${output}")
  endif()
endfunction()

# expect_no_source(TEXT WHAT): the text names no header folder of the source tree.
function(expect_no_source text what)
  foreach(folder include host s/)
    string(FIND "${text}" "${SOURCE_TREE}/${folder}" position)
    if(NOT position EQUAL -1)
      message(FATAL_ERROR "${what} takes something from the source tree's ${folder}:\n${text}")
    endif()
  endforeach()
endfunction()
