# Installs the libraries and headers, the CMake package project_management and the pkg-config file
# project-management.
include(CMakePackageConfigHelpers)

set(package_folder "${CMAKE_INSTALL_LIBDIR}/cmake/project_management")
install(TARGETS project_platform project_metadata project_management project_stores project_git project_session
  EXPORT project_management LIBRARY DESTINATION "${CMAKE_INSTALL_LIBDIR}")
install(EXPORT project_management NAMESPACE project:: DESTINATION "${package_folder}"
  FILE project_managementTargets.cmake)
install(DIRECTORY platform/include/ include/ stores/include/ adapters/git/include/ session/include/
  DESTINATION "${CMAKE_INSTALL_INCLUDEDIR}")
if(TARGET project_postgresql) # with an export of its own, so that it can be left out of an installation
  install(TARGETS project_postgresql EXPORT project_management_postgresql LIBRARY DESTINATION "${CMAKE_INSTALL_LIBDIR}")
  install(EXPORT project_management_postgresql NAMESPACE project:: DESTINATION "${package_folder}"
    FILE project_management_postgresqlTargets.cmake)
  install(DIRECTORY adapters/postgresql/include/ DESTINATION "${CMAKE_INSTALL_INCLUDEDIR}")
  install(FILES adapters/postgresql/sql/setup.sql DESTINATION "${CMAKE_INSTALL_DATADIR}/project-management")
endif()

install(DIRECTORY docs/json DESTINATION "${CMAKE_INSTALL_DATADIR}/project-management")

configure_package_config_file(packaging/project_managementConfig.cmake.in
  "${CMAKE_CURRENT_BINARY_DIR}/project_managementConfig.cmake" INSTALL_DESTINATION "${package_folder}"
  PATH_VARS CMAKE_INSTALL_BINDIR)
write_basic_package_version_file("${CMAKE_CURRENT_BINARY_DIR}/project_managementConfigVersion.cmake"
  COMPATIBILITY SameMinorVersion)
install(FILES
  "${CMAKE_CURRENT_BINARY_DIR}/project_managementConfig.cmake"
  "${CMAKE_CURRENT_BINARY_DIR}/project_managementConfigVersion.cmake"
  packaging/ProjectManagementFiles.cmake
  DESTINATION "${package_folder}")

# Relative to the file itself, because the prefix can change at installation.
file(RELATIVE_PATH from_pkgconfig_to_prefix "/prefix/${CMAKE_INSTALL_LIBDIR}/pkgconfig" "/prefix")
configure_file(packaging/project-management.pc.in "${CMAKE_CURRENT_BINARY_DIR}/project-management.pc" @ONLY)
install(FILES "${CMAKE_CURRENT_BINARY_DIR}/project-management.pc" DESTINATION "${CMAKE_INSTALL_LIBDIR}/pkgconfig")
