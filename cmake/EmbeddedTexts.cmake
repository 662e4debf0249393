# Embeds text files in a target.

set(PROJECT_EMBED_SCRIPT "${CMAKE_CURRENT_LIST_DIR}/WriteEmbeddedText.cmake")

# project_embed_text(<target> <namespace> <name> <file>...)
#
# Joins the files and links them into the target as `extern std::string_view const <name>` in the namespace. Call this in
# the folder that creates the target.
function(project_embed_text target namespace name)
  string(MAKE_C_IDENTIFIER "${namespace}_${name}" identifier)
  set(source "${CMAKE_CURRENT_BINARY_DIR}/${identifier}.cpp")
  list(TRANSFORM ARGN PREPEND "${CMAKE_CURRENT_SOURCE_DIR}/" OUTPUT_VARIABLE files)
  list(JOIN files "|" joined) # a list would not survive the command line
  add_custom_command(OUTPUT "${source}"
    COMMAND "${CMAKE_COMMAND}" "-DFILES=${joined}" "-DNAMESPACE=${namespace}" "-DNAME=${name}" "-DOUTPUT=${source}"
      -P "${PROJECT_EMBED_SCRIPT}"
    DEPENDS ${files} "${PROJECT_EMBED_SCRIPT}" VERBATIM COMMENT "Embedding the text ${namespace}::${name}")
  target_sources(${target} PRIVATE "${source}")
  set_source_files_properties("${source}" PROPERTIES SKIP_PRECOMPILE_HEADERS ON SKIP_UNITY_BUILD_INCLUSION ON)
endfunction()
