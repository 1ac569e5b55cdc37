# cmake --install: the library, its headers in a folder of their own, and what find_package and
# pkg-config need.
include(CMakePackageConfigHelpers)
install(TARGETS strutil EXPORT strutil ARCHIVE DESTINATION lib)
install(DIRECTORY include/ DESTINATION include/strutil)
install(EXPORT strutil NAMESPACE strutil:: DESTINATION lib/cmake/strutil FILE strutil-config.cmake)
write_basic_package_version_file(strutil-config-version.cmake COMPATIBILITY SameMajorVersion)
configure_file(cmake/strutil.pc.in strutil.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/strutil-config-version.cmake DESTINATION lib/cmake/strutil)
install(FILES ${PROJECT_BINARY_DIR}/strutil.pc DESTINATION lib/pkgconfig)
