# Toolchain file for Cortex-M0+ firmware built with Debian's arm-none-eabi GCC.
if(DEFINED CACHE{CMAKE_SYSTEM_PROCESSOR} OR DEFINED CACHE{CMAKE_CXX_FLAGS_INIT})
  message(FATAL_ERROR "this toolchain file is for the Cortex-M0+ alone: for another processor bring one "
    "of your own, with -mcpu in its flags")
endif()
set(CMAKE_SYSTEM_NAME Generic)
set(CMAKE_SYSTEM_PROCESSOR cortex-m0plus)
set(CMAKE_C_COMPILER arm-none-eabi-gcc)
set(CMAKE_CXX_COMPILER arm-none-eabi-g++)

# No program links before it has a board, so the compilers are tried on a library.
set(CMAKE_TRY_COMPILE_TARGET_TYPE STATIC_LIBRARY)

set(CMAKE_C_FLAGS_INIT "-mcpu=cortex-m0plus -mthumb")
set(CMAKE_CXX_FLAGS_INIT "-mcpu=cortex-m0plus -mthumb")

# CMake's own choice for Release, -O3, makes firmware larger and hardly faster.
set(CMAKE_C_FLAGS_RELEASE "-O2 -DNDEBUG" CACHE STRING "Flags of a Release build")
set(CMAKE_CXX_FLAGS_RELEASE "-O2 -DNDEBUG" CACHE STRING "Flags of a Release build")
