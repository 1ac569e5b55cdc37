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

# The version file compares predefined macros: the user's compiler must define each macro in processor.in with
# an equal or greater value, and use the same float ABI. Here the compiler replaces the names that are not in
# quotes by their values. A compiler that reports Arm state before ARMv6 has probably been given no -mcpu yet
# (a target may give it), so a package for ARMv6-M, which runs on every Cortex-M, is accepted there.
separate_arguments(flags UNIX_COMMAND "${CMAKE_CXX_FLAGS}")
execute_process(COMMAND ${CMAKE_CXX_COMPILER} ${flags} -E -P -x c++ ${PROJECT_SOURCE_DIR}/cmake/processor.in
  OUTPUT_VARIABLE fits)
string(REGEX REPLACE "[\"\n]" " " fits "${fits}")
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
