#include "project/stores/SharedLocation.hpp"

#include <string_view>

#include "fl/i18n/Utf8.hpp"
#include "journal/CompleteFile.hpp"
#include "journal/LocationFile.hpp"
#include "journal/UnfinishedCopy.hpp"
#include "line/JsonReader.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/TextBackend.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::stores {

char16_t const* const SharedLocation::fileName = u"store.json";
char16_t const* const SharedLocation::cacheName = u"cache";

namespace {

[[noreturn]] void throwDamaged(Disk const& disk, std::string const& problem) {
    throw StoreError(StoreError::Kind::Damaged, disk.folder() + '/' + LocationFile::name, 0, problem,
                     errorTexts.get("RemedyOfLocation"));
}

/// Reads one member, whose value is a string.
bool readMember(JsonReader& json, std::string_view name, std::string& value) {
    std::string_view found;
    std::string_view content;
    bool const isRead = json.string(found) && (found == name || json.fail("MemberUnknown")) &&
                        json.expect(':') && json.string(content);
    if (isRead) {
        value = fl::i18n::toUtf8(decodeJsonContent(content));
    }
    return isRead;
}

bool readVersion(JsonReader& json, unsigned long& version) {
    std::string_view found;
    return json.string(found) && (found == "version" || json.fail("MemberUnknown")) && json.expect(':') &&
           json.number(version);
}

SharedLocation parse(Disk const& disk, std::string_view bytes) {
    JsonReader json(bytes);
    SharedLocation result;
    std::string format;
    unsigned long version = 0;
    if (!json.expect('{') || !readMember(json, "format", format) || format != "project-store" ||
        !json.expect(',') || !readVersion(json, version)) {
        throwDamaged(disk, errorTexts.get("NotALocation"));
    }
    if (version != 1) {
        throw StoreError(StoreError::Kind::Refused, disk.folder() + '/' + LocationFile::name, 0,
                         errorTexts.get("LocationFormat", version), errorTexts.get("RemedyOfLocationFormat"));
    }
    bool const isRead = json.expect(',') && readMember(json, "kind", result.kind) && json.expect(',') &&
                        readMember(json, "service", result.service) && json.expect(',') &&
                        readMember(json, "project", result.project) && json.expect('}') && json.end();
    if (!isRead) {
        throwDamaged(disk, errorTexts.get("LocationUnreadable", json.problemText()));
    }
    return result;
}

std::string textName() {
    return fl::i18n::toUtf8(TextBackend::textName);
}

bool containsBoth(Disk& disk) {
    return disk.identify(LocationFile::name) && disk.identify(textName());
}

/// @return false if the name is taken.
bool createFile(Disk& disk, char const* name, std::string_view content, FileChanges& created) {
    bool const isCreated = createComplete(disk, LocationFile::temporary, name, content);
    if (isCreated) {
        created.added.push_back(pathIn(disk, name));
    }
    return isCreated;
}

[[noreturn]] void throwTaken(Disk const& disk) {
    throw StoreError(StoreError::Kind::Refused, disk.folder(), 0, errorTexts.get("ProjectExists"),
                     errorTexts.get("RemedyOfExistingProject"));
}

} // namespace

std::string LocationFile::contentOf(SharedLocation const& location) {
    std::string result = R"({"format":"project-store","version":1,"kind":)";
    appendJsonString(result, fl::i18n::fromUtf8(location.kind));
    result += R"(,"service":)";
    appendJsonString(result, fl::i18n::fromUtf8(location.service));
    result += R"(,"project":)";
    appendJsonString(result, fl::i18n::fromUtf8(location.project));
    return result + "}\n";
}

std::string newSharedProjectId() {
    return fl::i18n::toUtf8(metadata::generateUUID());
}

std::optional<SharedLocation> readSharedLocation(Disk& disk) {
    if (!disk.openFolder()) {
        return std::nullopt;
    }
    if (containsBoth(disk) && !finishCopyOfOther(disk) && containsBoth(disk)) {
        throwDamaged(disk, errorTexts.get("LocationBesideText"));
    }
    auto const content = disk.read(LocationFile::name, 0);
    if (!content) {
        return std::nullopt;
    }
    return parse(disk, content->bytes);
}

FileChanges createSharedLocation(Disk& disk, SharedLocation const& location) {
    disk.makeFolder();
    if (!disk.openFolder() || disk.identify(textName())) {
        throwTaken(disk);
    }
    FileChanges created;
    createFile(disk, LocationFile::ignored, LocationFile::ignoredContent, created);
    if (!createFile(disk, LocationFile::name, LocationFile::contentOf(location), created)) {
        throwTaken(disk);
    }
    disk.syncFolder();
    return created;
}

} // namespace project::stores
