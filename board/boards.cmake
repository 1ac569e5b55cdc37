# Executables for emulated boards, with picolibc: the micro:bit for firmware, and for tests this and
# two boards of Arm's with a Cortex-M3 and a Cortex-M33.
function(link_for_board target flash flash_size ram ram_size stack)
  target_compile_options(${target} PRIVATE -fno-exceptions)
  target_link_options(${target} PRIVATE --crt0=hosted -Wl,--gc-sections
    -Wl,--defsym=__flash=${flash},--defsym=__flash_size=${flash_size}
    -Wl,--defsym=__ram=${ram},--defsym=__ram_size=${ram_size},--defsym=__stack_size=${stack})
endfunction()

# microbit_firmware(TARGET): what a board runs by itself, as TARGET.hex beside the ELF: 256 KiB of
# flash, 16 KiB of RAM. It brings its own standard input and output. Numbers are integers.
function(microbit_firmware target)
  link_for_board(${target} 0 262144 0x20000000 16384 2048)
  target_compile_options(${target} PRIVATE --specs=picolibc.specs)
  target_compile_definitions(${target} PRIVATE PICOLIBC_INTEGER_PRINTF_SCANF)
  target_link_options(${target} PRIVATE --specs=picolibc.specs -DPICOLIBC_INTEGER_PRINTF_SCANF)
  set_target_properties(${target} PROPERTIES LINKER_LANGUAGE C)
  add_custom_command(TARGET ${target} POST_BUILD VERBATIM
    COMMAND ${CMAKE_OBJCOPY} -O ihex $<TARGET_FILE:${target}> $<TARGET_FILE:${target}>.hex)
endfunction()

# board_test(TARGET [MACHINE FLASH RAM]): a program for an emulated board alone, whose standard input
# and output and exit status are those of QEMU, by semihosting. Without a machine it is a micro:bit
# with a memory that none has, since a suite is large.
function(board_test target)
  if(ARGC EQUAL 1)
    set(ARGN "microbit;0;0x20000000")
    set(memory "-global;nrf51-soc.flash-size=1048576;-global;nrf51-soc.sram-size=262144;")
  endif()
  list(GET ARGN 0 machine)
  list(GET ARGN 1 flash)
  list(GET ARGN 2 ram)
  link_for_board(${target} ${flash} 1048576 ${ram} 262144 16384)
  target_compile_options(${target} PRIVATE --specs=picolibcpp.specs)
  target_link_options(${target} PRIVATE --specs=picolibcpp.specs --oslib=semihost)
  set_target_properties(${target} PROPERTIES CROSSCOMPILING_EMULATOR
    "${PROJECT_SOURCE_DIR}/board/on-board;-M;${machine};${memory}-kernel")
endfunction()
