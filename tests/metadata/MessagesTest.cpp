#include "project/metadata/Messages.hpp"

#include <ostream>
#include <set>

#include "fl/i18n/MessageCatalog.hpp"
#include "fl/i18n/Utf8.hpp"
#include "support/GlobalLocale.hpp"

namespace ZEPHRA::project::management {
namespace {

using fl::i18n::MessageCatalog;
using fl::i18n::toUtf8;
using Argument = ::resource_core::BaseMsgID::Argument;

std::u16string const first = u"<the first>";
std::u16string const second = u"<the second>";

struct Case {
    ::resource_core::BaseMsgID message;
    std::string name;
    std::vector<Argument> arguments;
};

void PrintTo(Case const& value, std::ostream* out) {
    *out << value.name;
}

std::vector<Case> everyError() {
    std::vector<Argument> const none;
    std::vector<Argument> const one = {first};
    std::vector<Argument> const two = {first, second};
    return {
        {FileNotInProject(first), "FileNotInProject", one},
        {FileIsMetadataError(first), "FileIsMetadataError", one},
        {FileNotInProjectRoot(first, second), "FileNotInProjectRoot", two},
        {FileDoesNotExistError(first), "FileDoesNotExistError", one},
        {RootFolderNotRemoveable(first), "RootFolderNotRemoveable", one},
        {SyncFolderUnsuitable(first), "SyncFolderUnsuitable", one},
        {SyncFolderMissing(first), "SyncFolderMissing", one},
        {EntryPointGroupUUIDDefined(first), "EntryPointGroupUUIDDefined", one},
        {EntryPointGroupNameDefined(first), "EntryPointGroupNameDefined", one},
        {EntryPointTypeUndefined(first), "EntryPointTypeUndefined", one},
        {CanNotModifyReadOnlyCategory(), "CanNotModifyReadOnlyCategory", none},
        {CanNotModifyReadOnlyLabel(), "CanNotModifyReadOnlyLabel", none},
        {CategoryDoesNotExist(first), "CategoryDoesNotExist", one},
        {CategoryDoesNotExistsByUUID(first), "CategoryDoesNotExistsByUUID", one},
        {CategoryExistsByName(first), "CategoryExistsByName", one},
        {LabelExistsByName(first, second), "LabelExistsByName", two},
        {LabelDoesNotExistsByUUID(first), "LabelDoesNotExistsByUUID", one},
        {LabelReadOnlyStateUndefined(first), "LabelReadOnlyStateUndefined", one},
        {DuplicatePathEntryException(first), "DuplicatePathEntryException", one},
        {DuplicateReferenceException(first), "DuplicateReferenceException", one},
    };
}

class EveryError : public testing::TestWithParam<Case> {};

INSTANTIATE_TEST_SUITE_P(Messages, EveryError, testing::ValuesIn(everyError()),
                         [](auto const& error) { return error.param.name; });

TEST_P(EveryError, hasItsClassForItsNameAndTheArgumentsInOrder) {
    auto const& [message, name, arguments] = GetParam();

    EXPECT_EQ(message.getCatalogName(), "ZEPHRA:project:management");
    EXPECT_EQ(message.getMessageName(), name);
    EXPECT_EQ(message.getArguments(), arguments);
}

TEST_P(EveryError, hasATextWithAllItsArgumentsInEachLanguage) {
    auto const& [message, name, arguments] = GetParam();

    for (auto const* locale : {"en", "de"}) {
        auto const text = toUtf8(MessageCatalog::get_message(message, locale));

        EXPECT_THAT(text, testing::Not(testing::StartsWith(name))) << locale;
        EXPECT_THAT(text, testing::Not(testing::HasSubstr("{"))) << locale;
        EXPECT_THAT(text, testing::EndsWith(".")) << locale;
        for (auto const& argument : arguments) {
            EXPECT_THAT(text, testing::HasSubstr(toUtf8(std::get<std::u16string>(argument)))) << locale;
        }
    }
}

TEST_P(EveryError, isTranslated) {
    auto const& message = GetParam().message;

    EXPECT_NE(MessageCatalog::get_message(message, "en"), MessageCatalog::get_message(message, "de"));
}

TEST(Messages, noTwoErrorsHaveTheSameText) {
    for (auto const* locale : {"en", "de"}) {
        std::set<std::u16string> texts;
        for (auto const& error : everyError()) {
            texts.insert(MessageCatalog::get_message(error.message, locale));
        }
        EXPECT_EQ(texts.size(), 20u) << locale;
    }
}

TEST(Messages, namesThePathFirstAndTheProjectRootSecond) {
    EXPECT_THAT(toUtf8(MessageCatalog::get_message(FileNotInProjectRoot(u"PATH", u"ROOT"), "en")),
                testing::MatchesRegex(".*PATH.* outside .* root folder .*ROOT.*"));
}

TEST(Messages, theLanguageOfTheNextTextIsTheOneThatTheApplicationSets) {
    auto const english = MessageCatalog::get_message(CanNotModifyReadOnlyLabel());

    ::project::test::GlobalLocale const german("de_DE");

    EXPECT_EQ(english, MessageCatalog::get_message(CanNotModifyReadOnlyLabel(), "en"));
    EXPECT_EQ(MessageCatalog::get_message(CanNotModifyReadOnlyLabel()),
              MessageCatalog::get_message(CanNotModifyReadOnlyLabel(), "de"));
}

TEST(Messages, aLanguageWithoutTextsGetsEnglish) {
    EXPECT_EQ(MessageCatalog::get_message(FileNotInProject(first), "fr"),
              MessageCatalog::get_message(FileNotInProject(first), "en"));
}

TEST(Messages, theDefaultGroupHasANameInEachLanguage) {
    auto const message = entryPointGroupDefaultName();

    EXPECT_EQ(message.getMessageName(), "EntryPointGroupDefaultName");
    EXPECT_THAT(message.getArguments(), testing::IsEmpty());
    EXPECT_EQ(MessageCatalog::get_message(message), u"Default");
    EXPECT_EQ(MessageCatalog::get_message(message, "de"), u"Standard");
}

TEST(Messages, argumentsMayBeAnyCodeUnits) {
    std::u16string const odd = {u'/', char16_t{0xDC80}, char16_t{0xD800}, u'\'', u'{', u'0', u'}'};

    auto const text = MessageCatalog::get_message(FileNotInProject(odd), "en");

    EXPECT_NE(text.find(odd), std::u16string::npos);
}

} // namespace
} // namespace ZEPHRA::project::management
