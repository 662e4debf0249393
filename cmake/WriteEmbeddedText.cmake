# Writes a C++ source with the joined content of some files; see EmbeddedTexts.cmake.
string(REPLACE "|" ";" files "${FILES}")
set(text "")
foreach(file IN LISTS files)
  file(READ "${file}" content)
  string(APPEND text "${content}")
endforeach()
if(text MATCHES "\\)embedded\"")
  message(FATAL_ERROR "${FILES} contain the end of a raw string")
endif()
# Only 65,536 characters of a literal are portable. The compilers that we use have no limit.
file(WRITE "${OUTPUT}" "#include <string_view>

#pragma GCC diagnostic ignored \"-Woverlength-strings\"

namespace ${NAMESPACE} {
extern std::string_view const ${NAME};
std::string_view const ${NAME} = R\"embedded(${text})embedded\";
} // namespace ${NAMESPACE}
")
