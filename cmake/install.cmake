# cmake --install: the library, its headers in a folder of their own, and what find_package and
# pkg-config need.
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)
set(package ${CMAKE_INSTALL_LIBDIR}/cmake/strutil)
install(TARGETS strutil EXPORT strutil ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR})
target_include_directories(strutil PUBLIC
  $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}/strutil>)
install(DIRECTORY include/ DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/strutil)
install(EXPORT strutil NAMESPACE strutil:: DESTINATION ${package} FILE strutil-targets.cmake)
install(FILES cmake/strutil-config.cmake DESTINATION ${package})

# What the compiler says of the processor, a project's compiler has to say as well, or more; and the
# same of the float ABI. The version file asks it. If that says ARM code before ARMv6, the processor is
# among the flags of a target: such a project may have ARMv6-M's code, which runs on every Cortex-M.
separate_arguments(flags UNIX_COMMAND "${CMAKE_CXX_FLAGS}")
execute_process(COMMAND ${CMAKE_CXX_COMPILER} ${flags} -E -dM -x c++ /dev/null
  OUTPUT_VARIABLE macros ERROR_QUIET)
string(REGEX MATCHALL "__(arm__|aarch64__|x86_64__|i386__|riscv|ARM_ARCH|ARM_ARCH_ISA_THUMB\
|ARM_FEATURE_DSP|ARM_FEATURE_IDIV|ARM_FEATURE_MVE|ARM_PCS_VFP) [0-9]+" macros "${macros}")
list(JOIN macros ", " built_for)
list(JOIN macros " && " fits)
string(REPLACE " " " >= " fits "${fits}")
string(REPLACE " >= && >= " " && " fits "${fits}")
if(NOT built_for MATCHES "PCS_VFP")
  string(APPEND fits " && !__ARM_PCS_VFP")
endif()
if(built_for MATCHES "__ARM_ARCH 6")
  string(APPEND fits " || (__arm__ && !__thumb__ && __ARM_ARCH < 6)")
endif()
write_basic_package_version_file(${PROJECT_BINARY_DIR}/version.cmake
  VERSION ${PROJECT_VERSION} COMPATIBILITY SameMajorVersion)
file(READ ${PROJECT_BINARY_DIR}/version.cmake version)
configure_file(cmake/version.cmake.in strutil-config-version.cmake @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/strutil-config-version.cmake DESTINATION ${package})

# An absolute folder for libraries cannot lead to the headers, so there the prefix is as configured.
if(IS_ABSOLUTE "${CMAKE_INSTALL_LIBDIR}")
  set(prefix "${CMAKE_INSTALL_PREFIX}")
else()
  file(RELATIVE_PATH prefix /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
  string(PREPEND prefix "\${pcfiledir}/")
endif()
configure_file(cmake/strutil.pc.in strutil.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/strutil.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
