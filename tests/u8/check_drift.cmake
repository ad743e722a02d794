cmake_minimum_required(VERSION 3.25)
# Runs u8gen into WORK and fails when its output differs from the file
# committed in COMMITTED.
file(REMOVE_RECURSE ${WORK})
file(MAKE_DIRECTORY ${WORK})
execute_process(COMMAND ${U8GEN} --out ${WORK} RESULT_VARIABLE rc)
if(NOT rc EQUAL 0)
  message(FATAL_ERROR "u8gen failed (${rc})")
endif()
execute_process(COMMAND ${CMAKE_COMMAND} -E compare_files ${WORK}/case_tables.cpp
                        ${COMMITTED}/case_tables.cpp RESULT_VARIABLE differs)
if(differs)
  message(FATAL_ERROR "src/kernel/u8/case_tables.cpp is out of date: build the "
                      "regenerate_u8_case_tables target and commit the result")
endif()
