# built_for(VARIABLE): for which processor the flags make code, or what names it if they do not. All of
# ARMv6-M is one: its code is the same, and runs on every Cortex-M. The float ABI is part of the name
# if it is the hard one.
function(built_for variable)
  set(flags "${CMAKE_C_FLAGS} ${CMAKE_CXX_FLAGS}")
  string(REGEX MATCHALL "-m(cpu|arch)=[^ ]+" named "${flags}")
  if(named)
    list(GET named -1 processor)
    string(REGEX REPLACE "^-m(cpu|arch)=" "" processor "${processor}")
  else()
    set(processor "${CMAKE_SYSTEM_PROCESSOR}")
  endif()
  string(REGEX REPLACE "^(cortex-m0.*|cortex-m1.*|armv6-?s?-m)$" "armv6-m" processor "${processor}")
  if(flags MATCHES "float-abi=hard")
    string(APPEND processor "-hard-float")
  endif()
  set(${variable} "${processor}" PARENT_SCOPE)
endfunction()
