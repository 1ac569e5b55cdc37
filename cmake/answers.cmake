# answers_test(TARGET INPUT ANSWERS): has ctest run a program, on the board if it is for the target,
# with the file INPUT as its input, and compare what it prints to the file ANSWERS, line for line.
function(answers_test target input answers)
  set(run)
  if(CMAKE_CROSSCOMPILING)
    microbit_firmware(${target})
    set(run "${PROJECT_SOURCE_DIR}/cmake/on-microbit -kernel ")
  endif()
  add_test(NAME ${target} COMMAND sh -c "${run}$<TARGET_FILE:${target}> <${input} | diff ${answers} -")
  set_tests_properties(${target} PROPERTIES TIMEOUT 60)
endfunction()
