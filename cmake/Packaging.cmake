# Installs the libraries and headers, the CMake package project_management and the pkg-config file
# project-management. Each component becomes a Debian package:
#   runtime      the shared libraries
#   postgresql   the library for shared projects
#   development  headers, static libraries, the CMake package, the pkg-config file
#   tool         projectctl, its completion and manual pages (see tools/projectctl), the schemas of its documents
include(CMakePackageConfigHelpers)

set(package_folder "${CMAKE_INSTALL_LIBDIR}/cmake/project_management")

# project_install_libraries(<export> <component> <target>...)
function(project_install_libraries export component)
  install(TARGETS ${ARGN} EXPORT ${export}
    LIBRARY DESTINATION "${CMAKE_INSTALL_LIBDIR}" COMPONENT ${component} NAMELINK_COMPONENT development
    ARCHIVE DESTINATION "${CMAKE_INSTALL_LIBDIR}" COMPONENT development
    FILE_SET HEADERS DESTINATION "${project_headers_folder}" COMPONENT development)
  install(EXPORT ${export} NAMESPACE project:: DESTINATION "${package_folder}" FILE ${export}Targets.cmake
    COMPONENT development)
endfunction()

project_install_libraries(project_management runtime
  project_platform project_metadata project_management project_stores project_git project_session)
if(TARGET project_postgresql) # with an export of its own, so that it can be left out of an installation
  project_install_libraries(project_management_postgresql postgresql project_postgresql)
  install(FILES adapters/postgresql/sql/setup.sql DESTINATION "${CMAKE_INSTALL_DATADIR}/project-management"
    COMPONENT postgresql)
endif()

install(DIRECTORY docs/json DESTINATION "${CMAKE_INSTALL_DATADIR}/project-management" COMPONENT tool
  FILES_MATCHING PATTERN "*.schema.json")

# The modules of pkg-config that a program links with static libraries, because the libraries use them.
set(private_modules)
if(project_library_type STREQUAL "STATIC")
  set(private_modules libxxhash nettle)
endif()
configure_package_config_file(packaging/project_managementConfig.cmake.in
  "${CMAKE_CURRENT_BINARY_DIR}/project_managementConfig.cmake" INSTALL_DESTINATION "${package_folder}"
  PATH_VARS CMAKE_INSTALL_BINDIR)
write_basic_package_version_file("${CMAKE_CURRENT_BINARY_DIR}/project_managementConfigVersion.cmake"
  COMPATIBILITY SameMinorVersion)
install(FILES
  "${CMAKE_CURRENT_BINARY_DIR}/project_managementConfig.cmake"
  "${CMAKE_CURRENT_BINARY_DIR}/project_managementConfigVersion.cmake"
  packaging/ProjectManagementFiles.cmake
  DESTINATION "${package_folder}" COMPONENT development)

# Relative to the file itself, because the prefix can change at installation.
file(RELATIVE_PATH from_pkgconfig_to_prefix "/prefix/${CMAKE_INSTALL_LIBDIR}/pkgconfig" "/prefix")
list(JOIN private_modules " " private_modules)
configure_file(packaging/project-management.pc.in "${CMAKE_CURRENT_BINARY_DIR}/project-management.pc" @ONLY)
install(FILES "${CMAKE_CURRENT_BINARY_DIR}/project-management.pc" DESTINATION "${CMAKE_INSTALL_LIBDIR}/pkgconfig"
  COMPONENT development)
