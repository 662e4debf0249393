#include "report/Columns.hpp"

#include <gmock/gmock.h>

namespace projectctl {
namespace {

std::string columnOf(Column const& column) {
    JsonWriter json;
    json.beginObject();
    writeColumn(json, "c", column);
    json.endObject();
    return json.bytes();
}

std::string pathsOf(std::vector<std::u16string> const& paths) {
    PathColumn column;
    for (auto const& path : paths) {
        column.add(path);
    }
    JsonWriter json;
    json.beginObject();
    column.write(json);
    json.endObject();
    return json.bytes();
}

TEST(Columns, areArraysUnlessRunsAreShorter) {
    EXPECT_EQ(columnOf({}), R"({"c":[]})");
    EXPECT_EQ(columnOf({1, 2, 3}), R"({"c":[1,2,3]})");
    EXPECT_EQ(columnOf(Column(20, 7)), R"({"c":{"runs":[7,20]}})");
}

TEST(Columns, storeOfEachPathTheRestAfterItsPredecessor) {
    EXPECT_EQ(pathsOf({u"src", u"src/io", u"src/io/pump.cpp", u"src/io/pumps.hpp", u"tools"}),
              R"({"shared":[0,3,6,11,0],"endingOf":[0,0,1,2,0],"endings":["",".cpp",".hpp"],)"
              R"("rests":"src//io//pump/s/tools"})");
}

TEST(Columns, storeNamesThatOnlyADamagedProjectHasAsAnArray) {
    EXPECT_EQ(pathsOf({u"a", u"a/", u"b//c"}),
              R"({"shared":[0,1,0],"endingOf":[0,0,0],"endings":[""],"rests":["a","/","b//c"]})");
}

TEST(JsonWriter, escapesEverythingThatHtmlOrTextCannotContain) {
    JsonWriter json;
    json.beginArray();
    json.text(u"</script>\n\x85\"");
    json.text(std::u16string(u"bad") + char16_t(0xDC80));
    json.text(std::string_view("\xFF"));
    json.endArray();

    EXPECT_EQ(json.bytes(), "[\"\\u003c/script>\\n\\u0085\\\"\",\"bad\\udc80\",\"\\udcff\"]");
}

} // namespace
} // namespace projectctl
