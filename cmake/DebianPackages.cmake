# The Debian packages that cpack builds, one for each component of the installation. Use the preset 'package'.

# project_add_package(<component> NAME <package> SUMMARY <line> DESCRIPTION <lines> [SECTION <section>]
#                     [DEPENDS <packages>] [SUGGESTS <packages>] [NEEDS <components>...])
#
# Declares the package of a component. dpkg-shlibdeps finds the packages of the libraries that its programs link; DEPENDS
# adds others. NEEDS lists the components of ours that it needs in exactly this version.
macro(project_add_package component)
  cmake_parse_arguments(package "" "NAME;SUMMARY;DESCRIPTION;SECTION;DEPENDS;SUGGESTS" "NEEDS" ${ARGN})
  string(TOUPPER "${component}" upper)
  list(APPEND CPACK_COMPONENTS_ALL ${component})
  set(CPACK_COMPONENT_${upper}_DESCRIPTION "${package_SUMMARY}\n${package_DESCRIPTION}")
  set(CPACK_COMPONENT_${upper}_DEPENDS ${package_NEEDS})
  set(CPACK_DEBIAN_${upper}_PACKAGE_NAME "${package_NAME}")
  set(CPACK_DEBIAN_${upper}_PACKAGE_SECTION "${package_SECTION}")
  set(CPACK_DEBIAN_${upper}_PACKAGE_DEPENDS "${package_DEPENDS}")
  set(CPACK_DEBIAN_${upper}_PACKAGE_SUGGESTS "${package_SUGGESTS}")
  install(FILES packaging/debian/copyright "${CMAKE_CURRENT_BINARY_DIR}/debian/changelog.gz"
    DESTINATION "${CMAKE_INSTALL_DATADIR}/doc/${package_NAME}" COMPONENT ${component})
endmacro()

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME project-management)
set(CPACK_PACKAGE_CONTACT "The authors of project-management <project-management@example.org>"
  CACHE STRING "The maintainer of the packages")
configure_file(packaging/debian/changelog.in "${CMAKE_CURRENT_BINARY_DIR}/debian/changelog" @ONLY)
execute_process(COMMAND gzip --best --no-name --keep --force "${CMAKE_CURRENT_BINARY_DIR}/debian/changelog"
  COMMAND_ERROR_IS_FATAL ANY)
set(CPACK_PACKAGE_DIRECTORY "${CMAKE_CURRENT_BINARY_DIR}/packages")
set(CPACK_STRIP_FILES ON)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ
  WORLD_EXECUTE)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_ENABLE_COMPONENT_DEPENDS ON)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS)
set(runtime_libraries platform metadata management stores git session)
foreach(library IN LISTS runtime_libraries)
  get_target_property(folder project_${library} BINARY_DIR)
  list(APPEND CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS "${folder}")
endforeach()

# project_add_control_files(<component> <library>...): makes the system find the libraries of a package, and other packages
# find out that they need it.
macro(project_add_control_files component)
  string(TOUPPER "${component}" upper)
  set(folder "${CMAKE_CURRENT_BINARY_DIR}/debian/${component}")
  set(shlibs)
  foreach(library IN ITEMS ${ARGN})
    string(APPEND shlibs
      "libproject_${library} ${project_soversion} ${CPACK_DEBIAN_${upper}_PACKAGE_NAME} (>= ${PROJECT_VERSION})\n")
  endforeach()
  file(WRITE "${folder}/shlibs" "${shlibs}")
  file(WRITE "${folder}/triggers" "activate-noawait ldconfig\n")
  set(CPACK_DEBIAN_${upper}_PACKAGE_CONTROL_EXTRA "${folder}/shlibs;${folder}/triggers")
endmacro()

# libgit2 is loaded by its name, which dpkg-shlibdeps cannot see. Debian names a library's package after that name.
get_property(libgit2_soname GLOBAL PROPERTY project_libgit2_soname)
string(REGEX REPLACE "^(.*[0-9])\\.so\\." "\\1-" libgit2_package "${libgit2_soname}")

project_add_package(runtime NAME libproject-management${project_soversion} SECTION libs
  SUMMARY "manages the definition of an engineering project"
  DESCRIPTION "The files of a project, labels on them, its entry points and its references
 to other projects, stored in one text file beside them. These are the shared
 libraries."
  DEPENDS "${libgit2_package}")
project_add_control_files(runtime ${runtime_libraries})
project_add_package(postgresql NAME libproject-postgresql${project_soversion} SECTION libs
  SUMMARY "projects that a team shares live on a PostgreSQL server"
  DESCRIPTION "An addition to project-management. Programs load this library when they open
 a project that a server stores."
  NEEDS runtime)
project_add_control_files(postgresql postgresql)
project_add_package(tool NAME projectctl SECTION devel
  SUMMARY "command-line tool for the definition of an engineering project"
  DESCRIPTION "Lists, labels, checks and merges the files of a project, with completion for
 bash, zsh and fish, manual pages, and schemas of its JSON documents."
  DEPENDS "${libgit2_package}" SUGGESTS "git, libproject-postgresql${project_soversion} (= ${PROJECT_VERSION})")
project_add_package(development NAME libproject-management-dev SECTION libdevel
  SUMMARY "manages the definition of an engineering project (development files)"
  DESCRIPTION "Headers, a CMake package and a pkg-config file, for C++ programs that use the
 libraries, and a CMake function for builds that compile the files of a project."
  DEPENDS "libboost-dev (>= 1.74), libicu-dev (>= 72)" SUGGESTS "projectctl (= ${PROJECT_VERSION})"
  NEEDS runtime postgresql)
if(PROJECT_MANAGEMENT_PYTHON)
  get_property(python_package GLOBAL PROPERTY project_python_package)
  project_add_package(python NAME python3-project-management SECTION python
    SUMMARY "manages the definition of an engineering project (Python module)"
    DESCRIPTION "The files of a project, labels on them, its entry points and its references
 to other projects, for Python programs."
    DEPENDS "${python_package}, ${libgit2_package}"
    SUGGESTS "python3-networkx, python3-pandas, libproject-postgresql${project_soversion} (= ${PROJECT_VERSION})")
  set(python_scripts "${CMAKE_CURRENT_SOURCE_DIR}/packaging/debian/python")
  set(CPACK_DEBIAN_PYTHON_PACKAGE_CONTROL_EXTRA "${python_scripts}/postinst;${python_scripts}/prerm")
endif()

include(CPack)
