#include "project/labels/LabelDataValidators.hpp"

#include <functional>

namespace project::management {
namespace {

using testing::ElementsAre;

LabelDataValidators const validators;

std::function<bool(LabelDataValidator&)> hasDataType(std::u16string const& type) {
    return [type](LabelDataValidator& validator) { return validator.getDataType() == type; };
}

std::function<bool(LabelDataValidator&)> hasDataClass(std::u16string const& name) {
    return [name](LabelDataValidator& validator) { return validator.getDataClass() == name; };
}

template <class Validator>
bool is(std::shared_ptr<LabelDataValidator> const& validator) {
    return dynamic_cast<Validator*>(validator.get()) != nullptr;
}

TEST(LabelDataValidators, returnTheFirstThatMatches) {
    EXPECT_TRUE(is<EmptyDataValidator>(validators.getValidator([](auto&) { return true; })));
}

TEST(LabelDataValidators, returnNullIfNoneMatches) {
    EXPECT_EQ(validators.getValidator([](auto&) { return false; }), nullptr);
}

TEST(LabelDataValidators, areFoundByDataType) {
    EXPECT_TRUE(is<EmptyDataValidator>(validators.getValidator(hasDataType(u"None"))));
    EXPECT_TRUE(is<StringDataValidator>(validators.getValidator(hasDataType(u"String"))));
    EXPECT_TRUE(is<LogicalDataValidator>(validators.getValidator(hasDataType(u"Logical"))));
}

TEST(LabelDataValidators, areFoundByDataClassWhichForStringsIsChar) {
    EXPECT_TRUE(is<EmptyDataValidator>(validators.getValidator(hasDataClass(u"none"))));
    EXPECT_TRUE(is<StringDataValidator>(validators.getValidator(hasDataClass(u"char"))));
    EXPECT_TRUE(is<LogicalDataValidator>(validators.getValidator(hasDataClass(u"logical"))));
}

TEST(LabelDataValidators, areNotFoundByTheClassAsTheType) {
    EXPECT_EQ(validators.getValidator(hasDataType(u"logical")), nullptr);
}

TEST(LabelDataValidators, areAskedInOrderUntilOneMatches) {
    std::vector<std::u16string> asked;
    validators.getValidator([&](LabelDataValidator& validator) {
        asked.push_back(validator.getDataType());
        return false;
    });
    EXPECT_THAT(asked, ElementsAre(u"None", u"String", u"Logical"));

    asked.clear();
    validators.getValidator([&](LabelDataValidator& validator) {
        asked.push_back(validator.getDataType());
        return asked.size() == 2;
    });
    EXPECT_THAT(asked, ElementsAre(u"None", u"String"));
}

TEST(LabelDataValidators, areSharedWithTheRegistry) {
    EXPECT_EQ(validators.getValidator(hasDataType(u"String")),
              validators.getValidator(hasDataType(u"String")));
}

TEST(LabelDataValidators, anEmptyFunctionObjectFailsAtItsFirstCall) {
    EXPECT_THROW(validators.getValidator({}), std::bad_function_call);
}

TEST(EmptyDataValidator, rejectsEveryTextAlsoTheEmptyOne) {
    EmptyDataValidator const validator;
    EXPECT_FALSE(validator.isValid(u""));
    EXPECT_FALSE(validator.isValid(u"None"));
    EXPECT_FALSE(validator.isValid(u"true"));
}

TEST(StringDataValidator, acceptsEveryTextTheEmptyOneIncluded) {
    StringDataValidator const validator;
    EXPECT_TRUE(validator.isValid(u""));
    EXPECT_TRUE(validator.isValid(u"any text"));
    EXPECT_TRUE(validator.isValid(std::u16string(1, char16_t(0xD800))));
}

TEST(LogicalDataValidator, acceptsTheTwoWordsInLowerCaseOnly) {
    LogicalDataValidator const validator;
    EXPECT_TRUE(validator.isValid(u"true"));
    EXPECT_TRUE(validator.isValid(u"false"));
    for (auto const* text : {u"", u"True", u"FALSE", u"truE", u" true", u"true ", u"1", u"0"}) {
        EXPECT_FALSE(validator.isValid(text)) << testing::PrintToString(std::u16string(text));
    }
}

} // namespace
} // namespace project::management
