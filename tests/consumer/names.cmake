# Fails if including the library has added names to this build that do not have its prefix: targets, options and other
# entries of the cache, commands. Call project_note_names first, and project_check_names at the end.
macro(project_note_names)
  get_cmake_property(noted_entries CACHE_VARIABLES)
  get_cmake_property(noted_commands COMMANDS)
endmacro()

# Names that CMake, its find modules and pkg-config add on their own.
set(names_of_others
  "^(CMAKE_|_GNUInstallDirs_|FIND_PACKAGE_|PKG_CONFIG|prefix_result|(pkgcfg_lib|__pkg_config_[a-z]+)_project_|Boost_|boost_|ICU_|CLI11_|nlohmann_json_)")

set(commands_of_modules "pkg_|pkgconfig_|fphsa_|find_package_|select_library_|boost|icu_|check_|cmake_check_|threads_|gnuinstalldirs_")

function(project_targets_below folder result)
  get_property(targets DIRECTORY "${folder}" PROPERTY BUILDSYSTEM_TARGETS)
  get_property(below DIRECTORY "${folder}" PROPERTY SUBDIRECTORIES)
  foreach(subfolder IN LISTS below)
    project_targets_below("${subfolder}" more)
    list(APPEND targets ${more})
  endforeach()
  set(${result} "${targets}" PARENT_SCOPE)
endfunction()

# project_require_names(<kind> <pattern> <name>...)
function(project_require_names kind pattern)
  list(FILTER ARGN EXCLUDE REGEX "${pattern}")
  if(ARGN)
    message(FATAL_ERROR "The library adds a ${kind} without its prefix: ${ARGN}")
  endif()
endfunction()

function(project_check_names library_folder)
  project_targets_below("${library_folder}" targets)
  list(LENGTH targets count)
  if(count LESS 10)
    message(FATAL_ERROR "Only ${count} targets were found")
  endif()
  project_require_names(target "^project(_|ctl)" ${targets})

  get_cmake_property(entries CACHE_VARIABLES)
  list(REMOVE_ITEM entries ${noted_entries})
  list(FILTER entries EXCLUDE REGEX "${names_of_others}")
  project_require_names("cache variable" "^_*(PROJECT_MANAGEMENT|project)_" ${entries})

  get_cmake_property(commands COMMANDS)
  list(REMOVE_ITEM commands ${noted_commands})
  project_require_names(command "^_*(project_|${commands_of_modules})" ${commands})
endfunction()
