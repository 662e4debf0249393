# project_management_files(<variable> [LABEL <category>[=<label>]...] [PATHS <path>...])
#
# Sets a variable to the files of the project that contains the current source folder, as absolute paths: all of them, or
# those that have every one of the labels and are at or below one of the paths, which are relative to the current source
# folder. Folders are left out. A change of the project's definition makes the build configure again, and nothing else
# does; changes of a project that a server stores are not noticed. Names with spaces and semicolons work; names with line
# ends do not.
#
# The cache variable PROJECT_MANAGEMENT_PROJECTCTL is the tool, projectctl.
function(project_management_files variable)
  cmake_parse_arguments(PARSE_ARGV 1 files "" "" "LABEL;PATHS")
  if(DEFINED files_UNPARSED_ARGUMENTS)
    message(FATAL_ERROR "project_management_files: unknown argument ${files_UNPARSED_ARGUMENTS}")
  endif()
  find_program(PROJECT_MANAGEMENT_PROJECTCTL projectctl HINTS "${project_management_PROGRAMS}"
    DOC "The tool of project_management")
  if(NOT PROJECT_MANAGEMENT_PROJECTCTL)
    message(FATAL_ERROR "project_management_files needs projectctl, which was not found. Install it, or set "
      "PROJECT_MANAGEMENT_PROJECTCTL to its path.")
  endif()
  execute_process(COMMAND "${PROJECT_MANAGEMENT_PROJECTCTL}" -C "${CMAKE_CURRENT_SOURCE_DIR}" root
    OUTPUT_VARIABLE root ERROR_VARIABLE error RESULT_VARIABLE result)
  if(NOT result EQUAL 0)
    message(FATAL_ERROR "project_management_files: ${error}")
  endif()
  string(REGEX REPLACE "\n$" "" root "${root}")

  set(conditions --kind file)
  foreach(label IN LISTS files_LABEL)
    list(APPEND conditions --label "${label}")
  endforeach()
  execute_process(
    COMMAND "${PROJECT_MANAGEMENT_PROJECTCTL}" -C "${CMAKE_CURRENT_SOURCE_DIR}" --full-name list ${conditions} -- ${files_PATHS}
    OUTPUT_VARIABLE found ERROR_VARIABLE error RESULT_VARIABLE result)
  if(NOT result EQUAL 0)
    message(FATAL_ERROR "project_management_files: ${error}")
  endif()

  # A list separates its items by semicolons, so those of names are escaped.
  string(REGEX REPLACE "\n$" "" found "${found}")
  if(NOT found STREQUAL "")
    string(PREPEND found "${root}/")
    string(REPLACE "\n" "\n${root}/" found "${found}")
    string(REPLACE ";" "\\;" found "${found}")
    string(REPLACE "\n" ";" found "${found}")
  endif()
  set(${variable} "${found}" PARENT_SCOPE)
  set(text "${root}/.projectdata/project.jsonl")
  if(EXISTS "${text}") # otherwise a server stores the definition
    set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS "${text}")
  endif()
endfunction()
