#include "rules/ContentRules.hpp"

#include <algorithm>
#include <array>
#include <string_view>

#include <strings.h>

#include "texts/ErrorTexts.hpp"

namespace project::git {

namespace {

/// The attributes that determine libgit2's conversions.
constexpr std::array<char const*, 4> converting{"text", "eol", "crlf", "ident"};

AttributeValue valueOf(AttributeRules::Values const& values, std::string_view name) {
    auto const found = values.find(name);
    return found == values.end() ? AttributeValue() : found->second;
}

/// From libgit2's form.
AttributeValue valueFrom(char const* attribute) {
    switch (libgit().git_attr_value(attribute)) {
    case GIT_ATTR_VALUE_TRUE:
        return {AttributeValue::Kind::Set};
    case GIT_ATTR_VALUE_FALSE:
        return {AttributeValue::Kind::Unset};
    case GIT_ATTR_VALUE_STRING:
        return {AttributeValue::Kind::Text, attribute};
    default:
        return {};
    }
}

bool isPlainUtf8(std::string const& encoding) {
    return strcasecmp(encoding.c_str(), "UTF-8") == 0 || strcasecmp(encoding.c_str(), "UTF8") == 0;
}

} // namespace

ContentRules::ContentRules(Repository const& repository) : repository_(repository), attributes_(repository) {
    std::string const lineEnds = repository.configured("core.autocrlf");
    hasConvertedLineEnds_ = lineEnds == "input" || repository.isSet("core.autocrlf", false);
}

Conversion ContentRules::conversionOf(TreePath const& path) {
    auto const values = attributes_.of(path);
    auto const isGiven = [&](std::string_view name) { return valueOf(values, name) != AttributeValue(); };
    Conversion result{hasConvertedLineEnds_ || std::any_of(converting.begin(), converting.end(), isGiven),
                      ""};
    std::string const driver = valueOf(values, "filter").text;
    std::string const encoding = valueOf(values, "working-tree-encoding").text;
    if (!driver.empty() && isConfigured(driver)) {
        result.foreign = errorTexts.get("FilterDriver", driver);
    } else if (!encoding.empty() && !isPlainUtf8(encoding)) {
        result.foreign = errorTexts.get("Encoding", encoding);
    } else if (result.isNeeded && !isKnownToLibGit(path, values)) {
        result.foreign = errorTexts.get("UnknownAttribute");
    }
    return result;
}

bool ContentRules::isKnownToLibGit(TreePath const& path, AttributeRules::Values const& values) const {
    auto names = converting;
    std::array<char const*, converting.size()> found{};
    require(libgit().git_attr_get_many(found.data(), repository_.get(), GIT_ATTR_CHECK_FILE_THEN_INDEX,
                                       path.c_str(), names.size(), names.data()),
            repository_.workTree().onDisk(path), "AttributesUnreadable");
    bool const isTextGiven = valueOf(values, "text") != AttributeValue();
    return std::equal(names.begin(), names.end(), found.begin(),
                      [&](std::string_view name, char const* attribute) {
                          // libgit2's macro "binary" sets it and git's does not
                          bool const isOverridden = isTextGiven && name == "crlf";
                          return isOverridden || valueOf(values, name) == valueFrom(attribute);
                      });
}

bool ContentRules::isConfigured(std::string const& driver) {
    auto const known = drivers_.find(driver);
    if (known != drivers_.end()) {
        return known->second;
    }
    std::string const section = "filter." + driver + '.';
    bool const hasCommand = !repository_.configured(section + "clean").empty() ||
                            !repository_.configured(section + "process").empty() ||
                            repository_.isSet(section + "required", false);
    return drivers_.try_emplace(driver, hasCommand).first->second;
}

} // namespace project::git
