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
write_basic_package_version_file(${PROJECT_BINARY_DIR}/strutil-config-version.cmake
  VERSION ${PROJECT_VERSION} COMPATIBILITY SameMajorVersion)
# The version file goes on to say for which processor this is.
include(cmake/processor.cmake)
built_for(built_for)
file(READ ${PROJECT_BINARY_DIR}/strutil-config-version.cmake version)
configure_file(cmake/version.cmake.in version.cmake @ONLY)
file(READ ${PROJECT_BINARY_DIR}/version.cmake processor)
file(WRITE ${PROJECT_BINARY_DIR}/strutil-config-version.cmake "${version}${processor}")
file(RELATIVE_PATH prefix /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
configure_file(cmake/strutil.pc.in strutil.pc @ONLY)
install(FILES cmake/strutil-config.cmake cmake/processor.cmake
  ${PROJECT_BINARY_DIR}/strutil-config-version.cmake
  DESTINATION ${package})
install(FILES ${PROJECT_BINARY_DIR}/strutil.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
