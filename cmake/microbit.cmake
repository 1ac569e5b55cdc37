# microbit_firmware(TARGET [LARGE]): links an executable with picolibc for the micro:bit, 256 KiB of
# flash and 16 KiB of RAM, and has ctest run it on the emulated board. LARGE gives it a memory that
# no such board has, for a test suite.
function(microbit_firmware target)
  set(flash 262144)
  set(ram 16384)
  set(stack 2048)
  set(board ${PROJECT_SOURCE_DIR}/cmake/on-microbit)
  if("LARGE" IN_LIST ARGN)
    set(flash 1048576)
    set(ram 262144)
    set(stack 16384)
    list(APPEND board -global nrf51-soc.flash-size=${flash} -global nrf51-soc.sram-size=${ram})
  endif()
  target_compile_options(${target} PRIVATE --specs=picolibcpp.specs -fno-exceptions)
  target_link_options(${target} PRIVATE
    --specs=picolibcpp.specs --oslib=semihost --crt0=hosted -Wl,--gc-sections
    -Wl,--defsym=__flash=0,--defsym=__flash_size=${flash}
    -Wl,--defsym=__ram=0x20000000,--defsym=__ram_size=${ram},--defsym=__stack_size=${stack})
  set_target_properties(${target} PROPERTIES CROSSCOMPILING_EMULATOR "${board};-kernel")
endfunction()
