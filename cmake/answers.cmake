# answers_test(TARGET INPUT ANSWERS): has ctest run a program, on the board if it is for the target,
# with the file INPUT as its input, and compare what it prints to the file ANSWERS, line for line.
function(answers_test target input answers)
  if(CMAKE_CROSSCOMPILING)
    microbit_firmware(${target})
  endif()
  add_test(NAME ${target} COMMAND ${PROJECT_SOURCE_DIR}/tests/answers ${input} ${answers}
    $<TARGET_PROPERTY:${target},CROSSCOMPILING_EMULATOR> $<TARGET_FILE:${target}>
    COMMAND_EXPAND_LISTS)
  set_tests_properties(${target} PROPERTIES TIMEOUT 60)
endfunction()
