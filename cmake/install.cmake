# What `cmake --install` puts in place: the library, the bundled host, their headers, the program, and what CMake and pkg-config projects find
# it by. Both descriptions go by their own place, so that an installed tree can be moved or installed under another prefix.
include(CMakePackageConfigHelpers)

set(package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/partnerkit)
install(TARGETS partnerkit partnerkit_host EXPORT partnerkitTargets)
install(TARGETS partnerkit_program)
install(DIRECTORY include/ ${PROJECT_BINARY_DIR}/include/ DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}
  FILES_MATCHING PATTERN "*.h")

install(EXPORT partnerkitTargets NAMESPACE partnerkit:: DESTINATION ${package_dir})
configure_package_config_file(cmake/partnerkitConfig.cmake.in partnerkitConfig.cmake INSTALL_DESTINATION ${package_dir})
write_basic_package_version_file(partnerkitConfigVersion.cmake COMPATIBILITY SameMinorVersion)
install(FILES
  ${PROJECT_BINARY_DIR}/partnerkitConfig.cmake ${PROJECT_BINARY_DIR}/partnerkitConfigVersion.cmake
  DESTINATION ${package_dir})

cmake_path(RELATIVE_PATH CMAKE_INSTALL_PREFIX
  BASE_DIRECTORY ${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig OUTPUT_VARIABLE pc_to_prefix)
foreach(package IN ITEMS partnerkit partnerkit-host)
  configure_file(cmake/${package}.pc.in ${package}.pc @ONLY)
  install(FILES ${PROJECT_BINARY_DIR}/${package}.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
endforeach()
