#include "text/TextLines.hpp"

#include "line/JsonReader.hpp"
#include "project/stores/StoreError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

namespace {

constexpr std::string_view formatName = "project-definition";
constexpr unsigned long version = 1;

struct FirstLine {
    unsigned long version; ///< 0 if it is not a first line
    bool isComplete;       ///< it has no members that this version does not know
};

FirstLine readFirstLine(std::string_view line) noexcept {
    JsonReader reader(line);
    std::string_view formatKey;
    std::string_view format;
    std::string_view versionKey;
    unsigned long number = 0;
    bool const isRead = reader.expect('{') && reader.string(formatKey) && reader.expect(':') &&
                        reader.string(format) && reader.expect(',') && reader.string(versionKey) &&
                        reader.expect(':') && reader.number(number);
    bool const isOurs = isRead && formatKey == "format" && format == formatName && versionKey == "version";
    return {isOurs ? number : 0, isOurs && reader.expect('}') && reader.end()};
}

} // namespace

bool checkFirstLine(std::string_view line, bool hasEnd, std::string const& file) {
    if (line == firstLine || (!hasEnd && firstLine.starts_with(line))) {
        return hasEnd;
    }
    FirstLine const first = readFirstLine(line);
    if (first.version > version) {
        throw StoreError(StoreError::Kind::Refused, file, 1, errorTexts.get("LaterFormat", first.version),
                         errorTexts.get("RemedyOfLaterFormat"));
    }
    if (first.version != version || !first.isComplete) {
        throw StoreError(StoreError::Kind::Damaged, file, 1, errorTexts.get("NotADefinition"),
                         errorTexts.get("RemedyOfNotADefinition"));
    }
    return hasEnd;
}

} // namespace project::stores
