# board_test(TARGET [MACHINE FLASH RAM]): links a program for an emulated board, with picolibc, and sets
# `emulator` to the command that runs its image. Standard output and the exit status are the program's.
# Without a machine it is a micro:bit, with more memory than a real one because the suite is large.
function(board_test target)
  set(memory)
  if(ARGC EQUAL 1)
    set(ARGN microbit 0 0x20000000)
    set(memory -global nrf51-soc.flash-size=1048576 -global nrf51-soc.sram-size=262144)
  endif()
  list(GET ARGN 0 machine)
  list(GET ARGN 1 flash)
  list(GET ARGN 2 ram)
  target_compile_options(${target} PRIVATE --specs=picolibcpp.specs -fno-exceptions)
  target_link_options(${target} PRIVATE --specs=picolibcpp.specs --oslib=semihost --crt0=hosted
    -Wl,--gc-sections,--defsym=__flash=${flash},--defsym=__flash_size=1048576
    -Wl,--defsym=__ram=${ram},--defsym=__ram_size=262144,--defsym=__stack_size=16384)
  set(emulator qemu-system-arm -display none -monitor none -serial none -chardev stdio,id=host
    -semihosting-config enable=on,target=native,chardev=host -M ${machine} ${memory} -kernel PARENT_SCOPE)
endfunction()
