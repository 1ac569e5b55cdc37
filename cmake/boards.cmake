# use_board(MACHINE FLASH RAM [OPTION...]): for the tests that follow, sets the options that link a program
# for an emulated board with picolibc, and the command that runs its image. Standard output and the exit
# status are the program's. FLASH and RAM are addresses.
macro(use_board machine flash ram)
  set(board_options --specs=picolibcpp.specs --oslib=semihost --crt0=hosted
    -Wl,--gc-sections,--defsym=__flash=${flash},--defsym=__flash_size=1048576
    -Wl,--defsym=__ram=${ram},--defsym=__ram_size=262144,--defsym=__stack_size=16384)
  set(emulator qemu-system-arm -display none -monitor none -serial none -chardev stdio,id=host
    -semihosting-config enable=on,target=native,chardev=host -M ${machine} ${ARGN} -kernel)
endmacro()
