# compile_by_clang(OBJECT OPTION...): compiles strutil.cpp for the target with Clang, in a build whose
# compiler is GCC.
find_program(CLANG clang++-19)
set(clang_for_target ${CLANG} --target=arm-none-eabi -mcpu=cortex-m0plus -ffreestanding)
file(GLOB headers ${PROJECT_SOURCE_DIR}/include/*.h)
function(compile_by_clang object)
  set(source ${PROJECT_SOURCE_DIR}/src/strutil.cpp)
  add_custom_command(OUTPUT ${object} DEPENDS ${source} ${headers}
    COMMAND ${clang_for_target} -std=c++17 ${ARGN} -ffunction-sections -fdata-sections
      -I${PROJECT_SOURCE_DIR}/include -c ${source} -o ${object} VERBATIM)
endfunction()
