#include "text/TextFrame.hpp"

#include "line/JsonReader.hpp"
#include "project/stores/StoreError.hpp"

namespace project::stores {

namespace {

constexpr std::string_view formatName = "project-definition";
constexpr unsigned long version = 1;

struct FirstLine {
    unsigned long version; ///< 0 when it is no first line
    bool isWhole;          ///< nothing stands in it that this version does not know
};

FirstLine readFirstLine(std::string_view line) noexcept {
    JsonReader reader(line);
    std::string_view formatKey;
    std::string_view format;
    std::string_view versionKey;
    unsigned long told = 0;
    bool const read = reader.expect('{') && reader.string(formatKey) && reader.expect(':') &&
                      reader.string(format) && reader.expect(',') && reader.string(versionKey) &&
                      reader.expect(':') && reader.number(told);
    bool const ours = read && formatKey == "format" && format == formatName && versionKey == "version";
    return {ours ? told : 0, ours && reader.expect('}') && reader.end()};
}

} // namespace

bool checkFirstLine(std::string_view line, bool hasEnd, std::string const& file) {
    if (line == firstLine || (!hasEnd && firstLine.starts_with(line))) {
        return hasEnd;
    }
    FirstLine const first = readFirstLine(line);
    if (first.version > version) {
        throw StoreError(file, 1,
                         "it is written in version " + std::to_string(first.version) + " of its format",
                         "Use a newer version of the program.");
    }
    if (first.version != version || !first.isWhole) {
        throw StoreError(file, 1, "this is no project definition",
                         "Move the file away or bring the right one back, for instance from source control.");
    }
    return hasEnd;
}

} // namespace project::stores
