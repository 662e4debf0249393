# Writes a C++ source with the table of some catalogs; see TextTables.cmake.
string(REPLACE "|" ";" files "${FILES}")
set(catalogs "")
set(languages "")
foreach(file IN LISTS files)
  get_filename_component(locale "${file}" NAME_WE)
  file(READ "${file}" catalog)
  # NAME { "text" } becomes {"NAME", "text"},
  string(REGEX REPLACE "\n    ([A-Za-z0-9]+) { (\"[^\n]*\") }" "\n    {\"\\1\", \\2}," catalog "${catalog}")
  string(REPLACE "\n${locale} {\n" "\nconstexpr TextTable::Text texts_${locale}[] = {\n" catalog "${catalog}")
  string(REGEX REPLACE "\n}\n$" "\n};\n" catalog "${catalog}")
  string(APPEND catalogs "${catalog}\n")
  string(APPEND languages "    {\"${locale}\", texts_${locale}},\n")
endforeach()
file(WRITE "${OUTPUT}" "#include \"fl/i18n/TextTable.hpp\"

namespace ${NAMESPACE} {

using fl::i18n::TextTable;

extern TextTable const errorTexts;

namespace {

${catalogs}
constexpr TextTable::Language languages[] = {
${languages}};

} // namespace

constinit TextTable const errorTexts(languages);

} // namespace ${NAMESPACE}
")
