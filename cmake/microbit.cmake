# Executables for the micro:bit: 256 KiB of flash, 16 KiB of RAM, and picolibc.
function(link_for_microbit target flash ram stack)
  target_compile_options(${target} PRIVATE -fno-exceptions)
  target_link_options(${target} PRIVATE --crt0=hosted -Wl,--gc-sections
    -Wl,--defsym=__flash=0,--defsym=__flash_size=${flash}
    -Wl,--defsym=__ram=0x20000000,--defsym=__ram_size=${ram},--defsym=__stack_size=${stack})
endfunction()

# microbit_firmware(TARGET): what a board runs by itself, as TARGET.hex beside the ELF. It brings its
# own standard input and output. Written and read numbers are integers.
function(microbit_firmware target)
  link_for_microbit(${target} 262144 16384 2048)
  target_compile_options(${target} PRIVATE --specs=picolibc.specs)
  target_compile_definitions(${target} PRIVATE PICOLIBC_INTEGER_PRINTF_SCANF)
  target_link_options(${target} PRIVATE --specs=picolibc.specs -DPICOLIBC_INTEGER_PRINTF_SCANF)
  set_target_properties(${target} PROPERTIES LINKER_LANGUAGE C)
  add_custom_command(TARGET ${target} POST_BUILD VERBATIM
    COMMAND ${CMAKE_OBJCOPY} -O ihex $<TARGET_FILE:${target}> $<TARGET_FILE:${target}>.hex)
endfunction()

# microbit_test(TARGET): a program for the emulated board alone, whose standard input and output and
# exit status are those of QEMU, by semihosting. A suite gets a memory that no such board has.
function(microbit_test target)
  set(flash 1048576)
  set(ram 262144)
  link_for_microbit(${target} ${flash} ${ram} 16384)
  target_compile_options(${target} PRIVATE --specs=picolibcpp.specs)
  target_link_options(${target} PRIVATE --specs=picolibcpp.specs --oslib=semihost)
  set_target_properties(${target} PROPERTIES CROSSCOMPILING_EMULATOR
    "${PROJECT_SOURCE_DIR}/cmake/on-microbit;-global;nrf51-soc.flash-size=${flash};-global;nrf51-soc.sram-size=${ram};-kernel")
endfunction()
