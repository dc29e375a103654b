include(CMakePackageConfigHelpers)

install(TARGETS vorlan EXPORT vorlanTargets
  LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
  ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR}
  RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR}
  INCLUDES DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(DIRECTORY include/vorlan DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(EXPORT vorlanTargets NAMESPACE vorlan:: DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/vorlan)

configure_package_config_file(cmake/vorlanConfig.cmake.in
  ${CMAKE_CURRENT_BINARY_DIR}/vorlanConfig.cmake
  INSTALL_DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/vorlan)
write_basic_package_version_file(${CMAKE_CURRENT_BINARY_DIR}/vorlanConfigVersion.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/vorlanConfig.cmake ${CMAKE_CURRENT_BINARY_DIR}/vorlanConfigVersion.cmake
  DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/vorlan)

# The pkg-config file finds the prefix relative to itself, so the installed tree can move.
file(RELATIVE_PATH VORLAN_PC_TO_PREFIX "/prefix/${CMAKE_INSTALL_LIBDIR}/pkgconfig" "/prefix")
configure_file(cmake/vorlan.pc.in ${CMAKE_CURRENT_BINARY_DIR}/vorlan.pc @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/vorlan.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
