# Compiles the texts of a library's errors into a table of constants.

set(PROJECT_TEXT_TABLE_SCRIPT "${CMAKE_CURRENT_LIST_DIR}/WriteTextTable.cmake")

# project_compile_texts(<target> <namespace> root.txt <locale>.txt...)
#
# Links the catalogs into the target as `fl::i18n::TextTable const errorTexts` in the namespace. Each catalog has the form
# that project_embed_messages reads, with a text on each line. Call this in the folder that creates the target.
function(project_compile_texts target namespace)
  string(MAKE_C_IDENTIFIER "${namespace}_errorTexts" identifier)
  set(source "${CMAKE_CURRENT_BINARY_DIR}/${identifier}.cpp")
  list(TRANSFORM ARGN PREPEND "${CMAKE_CURRENT_SOURCE_DIR}/" OUTPUT_VARIABLE files)
  list(JOIN files "|" joined) # a list would not survive the command line
  add_custom_command(OUTPUT "${source}"
    COMMAND "${CMAKE_COMMAND}" "-DFILES=${joined}" "-DNAMESPACE=${namespace}" "-DOUTPUT=${source}"
      -P "${PROJECT_TEXT_TABLE_SCRIPT}"
    DEPENDS ${files} "${PROJECT_TEXT_TABLE_SCRIPT}" VERBATIM COMMENT "Compiling the texts of ${namespace}")
  target_sources(${target} PRIVATE "${source}")
  set_source_files_properties("${source}" PROPERTIES SKIP_PRECOMPILE_HEADERS ON SKIP_UNITY_BUILD_INCLUSION ON)
endfunction()
