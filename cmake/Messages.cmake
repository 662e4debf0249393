# Compiles message texts and embeds them in a target.

find_program(PROJECT_MANAGEMENT_GENRB genrb REQUIRED)
find_program(PROJECT_MANAGEMENT_PKGDATA pkgdata REQUIRED)

# project_embed_messages(<target> <package> <locale>.txt...)
#
# Creates ICU package data from the texts, one bundle for each file, and links it into the target as the hidden
# array `extern "C" unsigned char const <package>[]`, aligned as ICU requires. Call this in the folder
# that creates the target, or in a folder that it adds.
function(project_embed_messages target package)
  set(folder "${CMAKE_CURRENT_BINARY_DIR}/${package}")
  file(MAKE_DIRECTORY "${folder}")
  set(data "${folder}/${package}.dat")
  set(texts)
  set(compile)
  set(bundles)
  foreach(text IN LISTS ARGN)
    get_filename_component(locale "${text}" NAME_WE)
    list(APPEND texts "${CMAKE_CURRENT_SOURCE_DIR}/${text}")
    list(APPEND bundles "${locale}.res")
    list(APPEND compile COMMAND "${PROJECT_MANAGEMENT_GENRB}" --quiet --encoding UTF-8 --destdir "${folder}"
      "${CMAKE_CURRENT_SOURCE_DIR}/${text}")
  endforeach()
  list(JOIN bundles "\n" bundles)
  file(CONFIGURE OUTPUT "${folder}/bundles.txt" CONTENT "${bundles}\n" @ONLY)

  add_custom_command(OUTPUT "${data}"
    ${compile}
    COMMAND "${PROJECT_MANAGEMENT_PKGDATA}" --quiet --mode common --name ${package} --sourcedir "${folder}" --destdir "${folder}"
      --tempdir "${folder}" bundles.txt
    DEPENDS ${texts} "${folder}/bundles.txt"
    WORKING_DIRECTORY "${folder}" VERBATIM COMMENT "Compiling the texts of ${package}")
  add_custom_target(${package}_data DEPENDS "${data}")

  file(CONFIGURE OUTPUT "${folder}/${package}.cpp" @ONLY CONTENT [=[
asm(".pushsection .rodata\n"
    ".balign 16\n"
    ".globl @package@\n"
    ".hidden @package@\n"
    ".type @package@, %object\n"
    "@package@:\n"
    ".incbin \"@data@\"\n"
    ".size @package@, .-@package@\n"
    ".popsection\n");
]=])
  target_sources(${target} PRIVATE "${folder}/${package}.cpp")
  set_source_files_properties("${folder}/${package}.cpp" TARGET_DIRECTORY ${target}
    PROPERTIES OBJECT_DEPENDS "${data}" SKIP_PRECOMPILE_HEADERS ON
    SKIP_UNITY_BUILD_INCLUSION ON) # the object of a group would not depend on the data
  add_dependencies(${target} ${package}_data)
endfunction()
