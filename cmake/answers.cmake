# answers_test(TARGET INPUT ANSWERS): has ctest run a program, on the board if it is for the target,
# with the file INPUT as its input, and compare what it prints to the file ANSWERS, line for line.
function(answers_test target input answers)
  if(CMAKE_CROSSCOMPILING)
    microbit_firmware(${target})
  endif()
  set(run "$<JOIN:$<TARGET_PROPERTY:${target},CROSSCOMPILING_EMULATOR>, > $<TARGET_FILE:${target}>")
  add_test(NAME ${target} COMMAND sh -c "${run} <${input} | diff ${answers} -")
  set_tests_properties(${target} PROPERTIES TIMEOUT 60)
endfunction()
